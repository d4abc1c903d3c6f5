#pragma once

#include <functional>

namespace CLI {
class App;
}

namespace talutil::cli {

/// Adds the subcommand "batch" to the command line; if it is chosen, `run` becomes its work.
void add_batch(CLI::App& app, std::function<void()>& run);

}  // namespace talutil::cli
