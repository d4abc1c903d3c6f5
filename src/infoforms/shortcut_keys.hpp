#pragma once

#include <span>

#include "automation/text.hpp"

namespace talutil {

/// A heading of the list of shortcut keys with its entries, one a line: an action, " = " (a few go without) and keys.
struct ShortcutSection {
  TextView heading;
  bool is_menu = false;  ///< A menu of the screen above it, rather than a screen of its own.
  TextView entries;
};

/// The shortcut keys of the host application, screen by screen.
[[nodiscard]] std::span<const ShortcutSection> shortcut_sections() noexcept;

/// The same as rich text: the headings of screens bold and underlined at 12 points, those of menus at 10, the entries
/// at 10, all in Courier New.
[[nodiscard]] Text shortcut_keys_rich_text();

}  // namespace talutil
