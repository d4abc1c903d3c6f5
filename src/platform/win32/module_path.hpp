#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// The full path of a module (null: the program), of any length. Raises 51 if the system does not know it.
[[nodiscard]] Text module_path(HMODULE module);

}  // namespace talutil::win32
