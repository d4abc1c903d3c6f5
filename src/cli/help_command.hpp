#pragma once

#include <CLI/CLI.hpp>
#include <string_view>

#include "cli/commands.hpp"

namespace talutil::cli {

/// `talutil help [SUBCOMMAND|MEMBER|TOPIC]`.
void add_help(CLI::App& app, Work& work);

/// Fails if a word is not a subcommand, and names those that were probably meant, or all.
void check_subcommand(const CLI::App& app, std::string_view word);

/// What tells more about the subcommand that was being parsed: "talutil config get --help".
[[nodiscard]] std::string help_hint(const CLI::App& app);

}  // namespace talutil::cli
