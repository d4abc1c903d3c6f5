#include "platform/win32/modality.hpp"

#include <algorithm>

namespace talutil::win32 {

namespace {

BOOL CALLBACK collect(HWND found, LPARAM list) {
  if (IsWindowVisible(found) != FALSE && IsWindowEnabled(found) != FALSE) {
    reinterpret_cast<std::vector<HWND>*>(list)->push_back(found);
  }
  return TRUE;
}

bool is_topmost(HWND window) { return (GetWindowLongPtrW(window, GWL_EXSTYLE) & WS_EX_TOPMOST) != 0; }

}  // namespace

void show_window(HWND window, int command) noexcept {
  ShowWindow(window, command);
  const bool is_hidden = IsWindowVisible(window) == FALSE;
  const bool is_in_corner = command != SW_SHOWMINIMIZED && IsIconic(window) != FALSE;
  if (is_hidden || is_in_corner) ShowWindow(window, command);
}

WaitingWindows::WaitingWindows(HWND window) : window_(window), owner_(GetActiveWindow()) {
  if (owner_ == window) owner_ = nullptr;
  EnumThreadWindows(GetCurrentThreadId(), &collect, reinterpret_cast<LPARAM>(&others_));
  std::erase(others_, window);
  for (const HWND other : others_) EnableWindow(other, FALSE);
  if (window == nullptr) return;
  // GWLP_HWNDPARENT is the owner of a top-level window: our window stays above it, and both share a button on the task
  // bar.
  SetWindowLongPtrW(window, GWLP_HWNDPARENT, reinterpret_cast<LONG_PTR>(owner_));
  // Not behind a window that is always on top and cannot be moved now.
  if (std::ranges::any_of(others_, &is_topmost)) {
    SetWindowPos(window, HWND_TOPMOST, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE | SWP_NOACTIVATE);
  }
}

WaitingWindows::~WaitingWindows() {
  // A system's dialog has hidden itself, and whoever is in front now has come there because of it.
  const bool was_in_front = window_ == nullptr || GetForegroundWindow() == window_;
  for (const HWND other : others_) {
    if (IsWindow(other) != FALSE) EnableWindow(other, TRUE);
  }
  const bool is_there = IsWindow(owner_) != FALSE;
  // The owner is activated before our window is hidden, so that there is never a moment without an active window.
  if (is_there)
    was_in_front ? static_cast<void>(SetForegroundWindow(owner_)) : static_cast<void>(SetActiveWindow(owner_));
  if (window_ != nullptr && IsWindow(window_) != FALSE) ShowWindow(window_, SW_HIDE);
}

RECT work_area_at(HWND window) noexcept {
  const HWND owner = GetWindow(window, GW_OWNER);
  MONITORINFO monitor{};
  monitor.cbSize = sizeof monitor;
  const DWORD otherwise = MONITOR_DEFAULTTOPRIMARY;
  GetMonitorInfoW(MonitorFromWindow(owner != nullptr ? owner : window, otherwise), &monitor);
  return monitor.rcWork;
}

}  // namespace talutil::win32
