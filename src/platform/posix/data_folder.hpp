#pragma once

#include <string>

namespace talutil::posix {

/// A variable of the environment; empty when it is not set.
[[nodiscard]] std::string environment(const char* name);

/// Where the library keeps what is the user's own: the hive and the drives.
[[nodiscard]] std::string data_folder();

}  // namespace talutil::posix
