#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// Puts a text on the clipboard. Raises 521 if another program keeps it open. `owner` is the window that copies.
void put_on_clipboard(HWND owner, TextView text);

}  // namespace talutil::win32
