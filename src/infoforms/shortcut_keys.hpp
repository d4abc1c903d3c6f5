#pragma once

#include <span>

#include "automation/text.hpp"

namespace talutil {

/// A heading of the list of shortcut keys with its entries, one per line: an action, " = " (missing in a few) and keys.
struct ShortcutSection {
  TextView heading;
  bool is_menu = false;  ///< A menu of the screen above, rather than a screen.
  TextView entries;
};

/// The shortcut keys of the host application, screen by screen.
[[nodiscard]] std::span<const ShortcutSection> shortcut_sections() noexcept;

/// The same as rich text: headings of screens bold and underlined at 12 points, headings of menus underlined at 10,
/// entries at 10, all in Courier New.
[[nodiscard]] Text shortcut_keys_rich_text();

}  // namespace talutil
