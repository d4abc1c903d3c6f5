#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// Makes a module's exceptions catchable in any process. Its DllMain calls these when the module is loaded and
/// unloaded.
///
/// On 32-bit Windows the compiler's start-up code registers a module's unwind tables with libgcc_s_dw2-1.dll if the
/// host or a plug-in has brought that into the process. The unwinder linked into this module then finds no tables, and
/// the first exception terminates the host (the compiler's bug 105507). So they are also registered with our own
/// unwinder. 64-bit Windows takes the tables from the loader.
void register_exception_frames(HMODULE module) noexcept;
void unregister_exception_frames() noexcept;

}  // namespace talutil::win32
