#pragma once

#include <optional>

#include "platform/win32/dots.hpp"
#include "platform/win32/handle.hpp"

/// What our windows share: a class, a procedure, and, for top-level windows, waiting until one is closed.
namespace talutil::win32 {

constexpr double twips_per_inch = 1440;

namespace kind {

/// A window class, by its name, registered while a window needs it: its procedure must not outlive the library.
struct WindowClass {
  using Handle = const wchar_t*;
  static void close(const wchar_t* name) noexcept { UnregisterClassW(name, own_module()); }
};

}  // namespace kind

/// A window whose messages are handled by this object while both exist. Several windows may share a class; the last one
/// unregisters it.
class OwnWindow {
 public:
  OwnWindow(const OwnWindow&) = delete;
  OwnWindow& operator=(const OwnWindow&) = delete;

  [[nodiscard]] HWND handle() const noexcept { return window_.get(); }

  /// The object of a window; null if the window is not ours.
  [[nodiscard]] static OwnWindow* of(HWND window) noexcept;

  /// Handles a keyboard message for navigation, before the system translates it to characters. Returns false for other
  /// messages.
  virtual bool take(MSG& /*message*/) { return false; }

 protected:
  /// @param background a system colour
  OwnWindow(const wchar_t* class_name, int background);
  virtual ~OwnWindow();

  /// Creates the window. Its messages go to the system until `attach` is called, then to `answer`. If creation fails,
  /// there is no window. The window takes ownership of the menu.
  void make(DWORD style, DWORD extended_style, HWND parent, const wchar_t* caption = L"",
            Owned<kind::Menu> menu = Owned<kind::Menu>());
  void attach() noexcept;

  /// Destroys the window without any further call of `answer`. Destructors of classes that override `answer` start with
  /// this.
  void destroy() noexcept;

  /// The window was destroyed from outside.
  void forget() noexcept { static_cast<void>(window_.release()); }

  /// Handles a message; returns nothing to leave it to the system.
  virtual std::optional<LRESULT> answer(UINT message, WPARAM what, LPARAM value) = 0;

  [[nodiscard]] RECT outer() const noexcept;  ///< Including the frame, in screen coordinates.
  [[nodiscard]] RECT inner() const noexcept;  ///< The client area, in its own coordinates.

 private:
  static LRESULT CALLBACK handle_message(HWND window, UINT message, WPARAM what, LPARAM value) noexcept;

  const wchar_t* class_name_;
  Owned<kind::WindowClass> class_;
  Owned<kind::Window> window_;
};

/// A top-level window that a call can wait for.
class TopWindow : public OwnWindow {
 protected:
  using OwnWindow::OwnWindow;

  /// Processes messages until the window is closed. A request to quit closes the window first and is then passed on to
  /// the host's loop.
  void wait_until_closed();

  /// Closes the window by code, on a request to quit.
  virtual void close_by_code() = 0;

  [[nodiscard]] bool is_closed() const noexcept { return is_closed_; }

  /// Ends the waiting; `wake` wakes up the loop, which may be asleep.
  void set_closed() noexcept { is_closed_ = true; }
  static void wake() noexcept;

 private:
  bool is_closed_ = false;
};

}  // namespace talutil::win32
