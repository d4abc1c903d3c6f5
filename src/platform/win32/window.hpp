#pragma once

#include <vector>

#include "platform/win32/handle.hpp"

/// What our windows have in common.
namespace talutil::win32 {

constexpr double twips_per_inch = 1440;

namespace kind {

/// A window class, by its name, for as long as a window needs it: its procedure must not outlive the library.
struct WindowClass {
  using Handle = const wchar_t*;
  static void close(const wchar_t* name) noexcept { UnregisterClassW(name, own_module()); }
};

}  // namespace kind

/// Several windows may share a class: the last one to go ends it.
/// @param background a system colour
[[nodiscard]] Owned<kind::WindowClass> register_class(const wchar_t* name, WNDPROC procedure, int background);

[[nodiscard]] int dots_per_inch(HWND window);

/// The other windows of this thread, which take no input while one is shown that they wait for.
class WaitingWindows {
 public:
  explicit WaitingWindows(HWND window);
  WaitingWindows(const WaitingWindows&) = delete;
  WaitingWindows& operator=(const WaitingWindows&) = delete;
  ~WaitingWindows();

  /// The one that was active before; null where none was.
  [[nodiscard]] HWND owner() const noexcept { return owner_; }

 private:
  HWND owner_;
  std::vector<HWND> windows_;
};

/// Handles messages until a window is closed. When the thread is asked to quit, the window is closed first: quitting is
/// for the loop of the host, which hears of it afterwards.
/// @param translate takes a message that it has handled itself: true
template <class Translate, class Close>
void handle_until(const bool& is_closed, Translate translate, Close close) {
  MSG message;
  while (!is_closed) {
    const BOOL answer = GetMessageW(&message, nullptr, 0, 0);
    if (answer <= 0) {
      close();
      if (answer == 0) PostQuitMessage(static_cast<int>(message.wParam));
      return;
    }
    if (translate(message)) continue;
    TranslateMessage(&message);
    DispatchMessageW(&message);
  }
}

}  // namespace talutil::win32
