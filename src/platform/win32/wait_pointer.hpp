#pragma once

#include "platform/platform.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// Shows the hourglass for as long as this exists.
class WaitPointer final : public Waiting {
 public:
  WaitPointer() noexcept : before_(SetCursor(LoadCursorW(nullptr, IDC_WAIT))) {}
  ~WaitPointer() override { SetCursor(before_); }

  /// Whether the user of this program, and not that of another, holds Esc.
  [[nodiscard]] bool is_given_up() const noexcept override {
    DWORD process = 0;
    GetWindowThreadProcessId(GetForegroundWindow(), &process);
    return process == GetCurrentProcessId() && GetAsyncKeyState(VK_ESCAPE) < 0;
  }

 private:
  HCURSOR before_;
};

}  // namespace talutil::win32
