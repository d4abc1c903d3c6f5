#include "platform/win32/window.hpp"

namespace talutil::win32 {

namespace {

/// The icon of the host's program, where it has one under the number that its tools give it.
HICON host_icon() {
  const HICON icon = LoadIconW(GetModuleHandleW(nullptr), MAKEINTRESOURCEW(1));
  return icon != nullptr ? icon : LoadIconW(nullptr, IDI_APPLICATION);
}

}  // namespace

Owned<kind::WindowClass> register_class(const wchar_t* name, WNDPROC procedure, int background) {
  WNDCLASSW description{};
  description.lpfnWndProc = procedure;
  description.hInstance = own_module();
  description.lpszClassName = name;
  description.hCursor = LoadCursorW(nullptr, IDC_ARROW);
  description.hIcon = host_icon();
  description.hbrBackground = reinterpret_cast<HBRUSH>(static_cast<INT_PTR>(background + 1));
  RegisterClassW(&description);
  return Owned<kind::WindowClass>(name);
}

int dots_per_inch(HWND window) {
  const Owned<kind::WindowDevice> device = device_of(window);
  return GetDeviceCaps(device.get(), LOGPIXELSX);
}

namespace {

BOOL CALLBACK collect(HWND found, LPARAM list) {
  if (IsWindowVisible(found) != FALSE && IsWindowEnabled(found) != FALSE) {
    reinterpret_cast<std::vector<HWND>*>(list)->push_back(found);
  }
  return TRUE;
}

}  // namespace

WaitingWindows::WaitingWindows(HWND window) : owner_(GetActiveWindow()) {
  if (owner_ == window) owner_ = nullptr;
  EnumThreadWindows(GetCurrentThreadId(), &collect, reinterpret_cast<LPARAM>(&windows_));
  std::erase(windows_, window);
  for (const HWND other : windows_) EnableWindow(other, FALSE);
}

WaitingWindows::~WaitingWindows() {
  for (const HWND other : windows_) EnableWindow(other, TRUE);
  if (owner_ != nullptr) SetForegroundWindow(owner_);
}

}  // namespace talutil::win32
