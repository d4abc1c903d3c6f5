#pragma once

#include "cli/commands.hpp"

namespace talutil::cli {

/// The subcommand that answers calls on standard input.
void add_batch(CLI::App& app, Work& work);

}  // namespace talutil::cli
