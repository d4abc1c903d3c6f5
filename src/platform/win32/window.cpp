#include "platform/win32/window.hpp"

#include "platform/win32/visual_styles.hpp"

namespace talutil::win32 {

namespace {

/// The first icon of the host's program, or the system's default.
HICON host_icon() {
  const HICON icon = LoadIconW(GetModuleHandleW(nullptr), MAKEINTRESOURCEW(1));
  return icon != nullptr ? icon : LoadIconW(nullptr, IDI_APPLICATION);
}

}  // namespace

OwnWindow::OwnWindow(const wchar_t* class_name, int background) : class_name_(class_name), class_(class_name) {
  WNDCLASSW description{};
  description.lpfnWndProc = &handle_message;
  description.hInstance = own_module();
  description.lpszClassName = class_name;
  description.hCursor = LoadCursorW(nullptr, IDC_ARROW);
  description.hIcon = host_icon();
  description.hbrBackground = reinterpret_cast<HBRUSH>(static_cast<INT_PTR>(background + 1));
  RegisterClassW(&description);
}

OwnWindow::~OwnWindow() { destroy(); }

OwnWindow* OwnWindow::of(HWND window) noexcept {
  // Compares the procedure of the class: someone may have subclassed the window.
  if (window == nullptr || GetClassLongPtrW(window, GCLP_WNDPROC) != reinterpret_cast<ULONG_PTR>(&handle_message)) {
    return nullptr;
  }
  return reinterpret_cast<OwnWindow*>(GetWindowLongPtrW(window, GWLP_USERDATA));
}

void OwnWindow::make(DWORD style, DWORD extended_style, HWND parent, const wchar_t* caption, Owned<kind::Menu> menu) {
  const VisualStyles styles;
  window_.reset(CreateWindowExW(extended_style, class_name_, caption, style, CW_USEDEFAULT, CW_USEDEFAULT, 0, 0, parent,
                                menu.get(), own_module(), nullptr));
  // A window destroys its menu itself.
  if (window_) static_cast<void>(menu.release());
}

void OwnWindow::attach() noexcept { SetWindowLongPtrW(window_.get(), GWLP_USERDATA, reinterpret_cast<LONG_PTR>(this)); }

void OwnWindow::destroy() noexcept {
  if (!window_) return;
  SetWindowLongPtrW(window_.get(), GWLP_USERDATA, 0);
  window_.reset();
}

RECT OwnWindow::outer() const noexcept {
  RECT place{};
  GetWindowRect(window_.get(), &place);
  return place;
}

RECT OwnWindow::inner() const noexcept {
  RECT place{};
  GetClientRect(window_.get(), &place);
  return place;
}

LRESULT CALLBACK OwnWindow::handle_message(HWND window, UINT message, WPARAM what, LPARAM value) noexcept {
  auto* const self = reinterpret_cast<OwnWindow*>(GetWindowLongPtrW(window, GWLP_USERDATA));
  if (self != nullptr && self->window_) {
    try {
      if (const auto answer = self->answer(message, what, value)) return *answer;
    } catch (...) {
      // Exceptions must not leave a window procedure.
    }
  }
  return DefWindowProcW(window, message, what, value);
}

void TopWindow::wait_until_closed() {
  MSG message;
  while (!is_closed_) {
    const BOOL answer = GetMessageW(&message, nullptr, 0, 0);
    if (answer <= 0) {
      close_by_code();
      if (answer == 0) PostQuitMessage(static_cast<int>(message.wParam));
      return;
    }
    if (take(message)) continue;
    TranslateMessage(&message);
    DispatchMessageW(&message);
  }
}

void TopWindow::wake() noexcept { PostThreadMessageW(GetCurrentThreadId(), WM_NULL, 0, 0); }

}  // namespace talutil::win32
