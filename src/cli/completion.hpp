#pragma once

#include <CLI/CLI.hpp>

#include "cli/commands.hpp"

namespace talutil::cli {

/// `talutil completion bash|zsh|fish`: a script that completes the subcommands and options of the parser and the names
/// of members.
void add_completion(CLI::App& app, Work& work);

}  // namespace talutil::cli
