#pragma once

#include <vector>

#include "platform/win32/windows.hpp"

/// Who may be used while one of our windows is waited for, and who comes to the front afterwards.
namespace talutil::win32 {

/// Shows a window, also in a process that was started hidden or minimised: the first call of ShowWindow in a process
/// may follow its STARTUPINFO instead of the command.
void show_window(HWND window, int command) noexcept;

/// Keeps the other windows of this thread disabled while a window, or a dialog of the system's, is waited for.
///
/// The windows are enabled again before the one that was waited for is hidden. In the other order the system would have
/// to activate a window of another program, because all of our windows are disabled (documented at EnableWindow: "must
/// enable the owner before destroying the dialog").
class WaitingWindows {
 public:
  /// @param window the window to be shown; null for a dialog of the system's, which hides itself
  explicit WaitingWindows(HWND window);
  WaitingWindows(const WaitingWindows&) = delete;
  WaitingWindows& operator=(const WaitingWindows&) = delete;

  /// Enables the windows, hides the one that was waited for, and activates its owner: to the front if that window was
  /// there, otherwise only within this program, since the user has gone elsewhere meanwhile.
  ~WaitingWindows();

  /// The window that was active before; null if none was.
  [[nodiscard]] HWND owner() const noexcept { return owner_; }

 private:
  HWND window_;
  HWND owner_;
  std::vector<HWND> others_;
};

/// The part of the monitor that a window is on, or that most of its owner is on, which programs may use.
[[nodiscard]] RECT work_area_at(HWND window) noexcept;

}  // namespace talutil::win32
