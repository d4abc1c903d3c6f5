#pragma once

#include <CLI/CLI.hpp>
#include <memory>
#include <optional>
#include <string>
#include <type_traits>
#include <vector>

#include "cli/commands.hpp"

/// What the subcommands' options have in common.
namespace talutil::cli {

/// Lets the parser choose a subcommand's work. The options live as long as the work that reads them.
template <class Options, class Function>
void choose(CLI::App& command, Work& work, std::shared_ptr<Options> options, Function function) {
  command.callback([&work, options, function] {
    work = [options, function]() -> int {
      if constexpr (std::is_void_v<decltype(function(*options))>) {
        function(*options);
        return 0;
      } else {
        return function(*options);
      }
    };
  });
}

/// --set NAME=VALUE, which may be repeated.
void add_settings(CLI::App& command, std::vector<std::string>& settings, const std::string& help);

/// --json, by which answers and errors are JSON.
void add_json(CLI::App& command, bool& is_json, const std::string& help);

/// --encoding NAME, of an input.
void add_encoding(CLI::App& command, std::string& name);

/// --code-page NUMBER.
void add_code_page(CLI::App& command, std::optional<std::uint32_t>& number, const std::string& use);

}  // namespace talutil::cli
