#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// Lets the exceptions of a module be caught in any process: called by its DllMain when the module is loaded and
/// unloaded.
///
/// On 32-bit Windows the compiler's start code registers a module's unwinding tables with libgcc_s_dw2-1.dll where that
/// is in the process already, since the host or a plug-in was linked with it; the unwinder linked into this module then
/// finds none, and the first exception ends the host (known as bug 105507 of the compiler). So they are registered with
/// our own unwinder too. 64-bit Windows has the tables from the loader.
void register_exception_frames(HMODULE module) noexcept;
void unregister_exception_frames() noexcept;

}  // namespace talutil::win32
