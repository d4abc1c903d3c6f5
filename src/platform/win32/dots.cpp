#include "platform/win32/dots.hpp"

#include "platform/win32/handle.hpp"

namespace talutil::win32 {

namespace {

constexpr int usual_dots = 96;

template <class Function>
Function user_function(const char* name) {
  return late_function<Function>(L"user32.dll", name);
}

}  // namespace

int system_dots() noexcept {
  // Loaded already, because windows need it; and no static variable, whose guard costs more than the look.
  const auto of_system = reinterpret_cast<UINT(WINAPI*)()>(
      reinterpret_cast<void*>(GetProcAddress(GetModuleHandleW(L"user32.dll"), "GetDpiForSystem")));
  return of_system == nullptr ? 0 : static_cast<int>(of_system());
}

int dots_per_inch(HWND window) {
  static const auto of_window = user_function<UINT(WINAPI*)(HWND)>("GetDpiForWindow");
  if (of_window != nullptr) {
    if (const UINT dots = of_window(window); dots != 0) return static_cast<int>(dots);
  }
  const Owned<kind::WindowDevice> device = device_of(window);
  return GetDeviceCaps(device.get(), LOGPIXELSX);
}

int scaled(int pixels, HWND window) { return MulDiv(pixels, dots_per_inch(window), usual_dots); }

NONCLIENTMETRICSW window_metrics(int dots) {
  static const auto for_dots =
      user_function<BOOL(WINAPI*)(UINT, UINT, void*, UINT, UINT)>("SystemParametersInfoForDpi");
  NONCLIENTMETRICSW metrics{};
  metrics.cbSize = sizeof metrics;
  if (for_dots != nullptr &&
      for_dots(SPI_GETNONCLIENTMETRICS, sizeof metrics, &metrics, 0, static_cast<UINT>(dots)) != FALSE) {
    return metrics;
  }
  SystemParametersInfoW(SPI_GETNONCLIENTMETRICS, sizeof metrics, &metrics, 0);
  return metrics;
}

void add_frame(RECT& place, DWORD style, DWORD extended_style, int dots) {
  static const auto for_dots =
      user_function<BOOL(WINAPI*)(RECT*, DWORD, BOOL, DWORD, UINT)>("AdjustWindowRectExForDpi");
  if (for_dots != nullptr && for_dots(&place, style, FALSE, extended_style, static_cast<UINT>(dots)) != FALSE) return;
  AdjustWindowRectEx(&place, style, FALSE, extended_style);
}

}  // namespace talutil::win32
