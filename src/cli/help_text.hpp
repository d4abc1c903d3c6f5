#pragma once

#include <CLI/CLI.hpp>
#include <string>
#include <string_view>

namespace talutil::cli {

/// Writes help with lines no longer than the terminal is wide (at most 100 characters; 80 without a terminal).
class HelpFormatter : public CLI::Formatter {
 public:
  std::string make_help(const CLI::App* app, std::string name, CLI::AppFormatMode mode) const override;
};

/// A help page that belongs to no subcommand, such as "exit-codes"; nothing if there is none of that name.
[[nodiscard]] std::string help_topic(std::string_view name);

/// The names of these pages, separated by commas.
[[nodiscard]] std::string help_topics();

}  // namespace talutil::cli
