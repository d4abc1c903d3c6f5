#pragma once

#include "automation/text.hpp"

namespace talutil {

/// The shortcut keys of the host application, screen by screen, as rich text: headings of screens bold and underlined
/// at 12 points, headings of menus underlined at 10, entries at 10, all in Courier New.
[[nodiscard]] Text shortcut_keys_rich_text();

}  // namespace talutil
