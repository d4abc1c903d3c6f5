#pragma once

#include <vector>

#include "automation/text.hpp"

/// Lines in the order in which they are seen. Texts are kept in the order in which they are read until a line is laid
/// out, so that they can be measured, wrapped and searched.
namespace talutil {

/// Whether a character only steers the direction or the joining of others; it is never drawn.
[[nodiscard]] constexpr bool is_invisible(char16_t unit) noexcept {
  return (unit >= 0x200B && unit <= 0x200F) || (unit >= 0x202A && unit <= 0x202E) ||
         (unit >= 0x2060 && unit <= 0x2069) || unit == 0x061C || unit == 0xFEFF;
}

/// Whether a character stands on the one before it.
[[nodiscard]] bool is_mark(char16_t unit);

/// Whether a paragraph runs from right to left, by its first letter that has a direction.
[[nodiscard]] bool is_right_to_left(TextView paragraph);

/// Whether a line is seen from left to right as it is read, so that it need not be put into order.
[[nodiscard]] bool is_seen_as_read(TextView line);

/// A part of a line that runs in one direction.
struct DirectedText {
  Text text;  ///< In the order in which it is read, without invisible characters.
  bool is_right_to_left = false;
};

/// The parts of a line from left to right.
[[nodiscard]] std::vector<DirectedText> in_visual_order(TextView line, bool is_paragraph_right_to_left);

/// A part that runs from right to left as it is drawn from left to right: reversed, and with brackets and other
/// signs mirrored. Marks come before their letters, over which the fonts draw them.
[[nodiscard]] Text drawn_from_left(TextView right_to_left);

}  // namespace talutil
