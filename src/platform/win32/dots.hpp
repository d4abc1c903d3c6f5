#pragma once

#include "platform/win32/windows.hpp"

/// Dots per inch. Programs that scale their windows by the monitor (per-monitor DPI awareness, version 2) have windows
/// in the monitor's own dots, which change with WM_DPICHANGED when a window is moved to another one; in all others the
/// system scales the windows or there is one number for all monitors. The functions "...ForDpi" exist from Windows 10
/// on.
namespace talutil::win32 {

constexpr UINT wm_dpi_changed = 0x02E0;  ///< WM_DPICHANGED, which the tool chain's headers have for later systems only.

/// The system's dots per inch (GetDpiForSystem, from version 1607 of Windows 10 on) without a device context; 0 on
/// earlier systems.
[[nodiscard]] int system_dots() noexcept;

/// The dots per inch of a window (GetDpiForWindow), or of the system.
[[nodiscard]] int dots_per_inch(HWND window);

/// A length in pixels at 96 dots per inch, in those of a window.
[[nodiscard]] int scaled(int pixels, HWND window);

/// The metrics of windows' fonts and frames at a number of dots per inch (SystemParametersInfoForDpi).
[[nodiscard]] NONCLIENTMETRICSW window_metrics(int dots);

/// Adds the frame that a window with these styles has to the rectangle of its inside (AdjustWindowRectExForDpi).
void add_frame(RECT& place, DWORD style, DWORD extended_style, int dots);

}  // namespace talutil::win32
