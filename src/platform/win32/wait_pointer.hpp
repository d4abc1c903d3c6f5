#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// Shows the hourglass for as long as this exists.
class WaitPointer {
 public:
  WaitPointer() noexcept : before_(SetCursor(LoadCursorW(nullptr, IDC_WAIT))) {}
  WaitPointer(const WaitPointer&) = delete;
  WaitPointer& operator=(const WaitPointer&) = delete;
  ~WaitPointer() { SetCursor(before_); }

 private:
  HCURSOR before_;
};

}  // namespace talutil::win32
