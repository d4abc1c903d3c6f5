#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// Raises the run-time error for a system error code concerning a file.
[[noreturn]] void raise_for(DWORD code);
[[noreturn]] inline void raise_last_error() { raise_for(GetLastError()); }

}  // namespace talutil::win32
