#pragma once

#include <string>

namespace talutil::posix {

/// An environment variable; empty if it is not set.
[[nodiscard]] std::string environment(const char* name);

/// The folder with the user's data: the hive and the drives.
[[nodiscard]] std::string data_folder();

}  // namespace talutil::posix
