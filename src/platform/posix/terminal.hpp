#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace talutil::posix {

/// Reads a line from the terminal; returns nothing if there is no terminal or its input has ended.
[[nodiscard]] std::optional<std::string> ask_terminal(std::string_view prompt);

}  // namespace talutil::posix
