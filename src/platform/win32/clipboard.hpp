#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// Puts a text on the clipboard. Raises 521 where another program keeps it open.
/// @param owner the window that puts it there
void put_on_clipboard(HWND owner, TextView text);

}  // namespace talutil::win32
