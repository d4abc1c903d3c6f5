#pragma once

#include <optional>
#include <vector>

#include "platform/win32/handle.hpp"

/// What our windows have in common: a class, a procedure, and at the top the waiting of a call until one is closed.
namespace talutil::win32 {

constexpr double twips_per_inch = 1440;

namespace kind {

/// A window class, by its name, for as long as a window needs it: its procedure must not outlive the library.
struct WindowClass {
  using Handle = const wchar_t*;
  static void close(const wchar_t* name) noexcept { UnregisterClassW(name, own_module()); }
};

}  // namespace kind

[[nodiscard]] int dots_per_inch(HWND window);

/// A window whose messages an object answers for as long as both are there. Several may share a class: the last one to
/// go ends it.
class OwnWindow {
 public:
  OwnWindow(const OwnWindow&) = delete;
  OwnWindow& operator=(const OwnWindow&) = delete;

  [[nodiscard]] HWND handle() const noexcept { return window_.get(); }

  /// The object of a window; null where it is not ours.
  [[nodiscard]] static OwnWindow* of(HWND window) noexcept;

  /// Handles a message of the keyboard that moves about the window, before the system makes characters of it. False for
  /// other messages.
  virtual bool take(MSG& /*message*/) { return false; }

 protected:
  /// @param background a system colour
  OwnWindow(const wchar_t* class_name, int background);
  virtual ~OwnWindow();

  /// Makes the window, which answers from `attach` on: until then messages are the system's. Leaves none where the
  /// system makes none.
  /// @param menu goes over to the window
  void make(DWORD style, DWORD extended_style, HWND parent, const wchar_t* caption = L"",
            Owned<kind::Menu> menu = Owned<kind::Menu>());
  void attach() noexcept;

  /// Ends the window, which answers no more. Destructors of classes that answer begin with it.
  void destroy() noexcept;

  /// The window has ended by somebody else's doing.
  void forget() noexcept { static_cast<void>(window_.release()); }

  /// Answers a message; nothing leaves it to the system.
  virtual std::optional<LRESULT> answer(UINT message, WPARAM what, LPARAM value) = 0;

  [[nodiscard]] RECT outer() const noexcept;  ///< The window with its frame, on the screen.
  [[nodiscard]] RECT inner() const noexcept;  ///< The inside, from its own corner.

 private:
  static LRESULT CALLBACK handle_message(HWND window, UINT message, WPARAM what, LPARAM value) noexcept;

  const wchar_t* class_name_;
  Owned<kind::WindowClass> class_;
  Owned<kind::Window> window_;
};

/// A window at the top, which a call can wait for.
class TopWindow : public OwnWindow {
 protected:
  using OwnWindow::OwnWindow;

  /// Handles messages until the window is closed. When the thread is asked to quit, the window is closed first:
  /// quitting is for the loop of the host, which hears of it afterwards.
  void wait_until_closed();

  /// Closes the window, as code does, when the thread is asked to quit.
  virtual void close_by_code() = 0;

  [[nodiscard]] bool is_closed() const noexcept { return is_closed_; }

  /// Ends the waiting; the loop, which may be asleep, hears of it by `wake`.
  void set_closed() noexcept { is_closed_ = true; }
  static void wake() noexcept;

 private:
  bool is_closed_ = false;
};

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

}  // namespace talutil::win32
