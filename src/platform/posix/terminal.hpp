#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace talutil::posix {

/// A line typed at the terminal; empty optional where there is no terminal or its input has ended.
[[nodiscard]] std::optional<std::string> ask_terminal(std::string_view prompt);

}  // namespace talutil::posix
