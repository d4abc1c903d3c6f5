#pragma once

#include <cstdint>

#include "automation/text.hpp"

namespace talutil {

constexpr TextView line_break = u"\r\n";

/// True for 0 to 9, and for the characters whose ANSI substitute is one of them.
[[nodiscard]] inline bool is_digit(char16_t unit) noexcept {
  return is_decimal_digit(ansi_code(unit));
}

}  // namespace talutil
