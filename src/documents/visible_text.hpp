#pragma once

#include "automation/text.hpp"

namespace talutil {

/// Whether a character has no shape of its own. Tabs and line ends count.
[[nodiscard]] constexpr bool is_control(char16_t unit) noexcept { return unit < u' ' || (unit >= 0x7F && unit < 0xA0); }

/// A text as reports show it in cells, boxes, headers and titles: control characters as "^A", tabs as blanks up to the
/// next multiple of eight characters in the line, line ends of every kind as line feeds.
[[nodiscard]] Text visible_text(TextView text);

/// The same on one line, with a blank for each line end.
[[nodiscard]] Text visible_line(TextView text);

/// A control character in caret notation.
void append_visible(Text& text, char16_t control);

}  // namespace talutil
