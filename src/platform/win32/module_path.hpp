#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// The full path of a module, the program's for null, however long it is. Raises 51 where the system has none.
[[nodiscard]] Text module_path(HMODULE module);

}  // namespace talutil::win32
