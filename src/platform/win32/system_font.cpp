#include "platform/win32/system_font.hpp"

#include "platform/win32/dots.hpp"

namespace talutil::win32 {

SystemFont::SystemFont(int dots) {
  const NONCLIENTMETRICSW metrics = window_metrics(dots);
  font_.reset(CreateFontIndirectW(&metrics.lfMessageFont));
  const Owned<kind::WindowDevice> context = device_of(nullptr);
  const Owned<kind::Selection> selected = select(context.get(), get());
  constexpr wchar_t letters[] = L"ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz";
  SIZE size{};
  GetTextExtentPoint32W(context.get(), letters, 52, &size);
  // The average letter width, rounded as the system's dialogs do.
  width_ = (static_cast<int>(size.cx) / 26 + 1) / 2;
  height_ = static_cast<int>(size.cy);
}

int SystemFont::height_of(const Text& text, int width) const {
  RECT place{0, 0, width, 0};
  const Owned<kind::WindowDevice> context = device_of(nullptr);
  const Owned<kind::Selection> selected = select(context.get(), get());
  constexpr UINT format = DT_CALCRECT | DT_WORDBREAK | DT_NOPREFIX | DT_EXPANDTABS | DT_EDITCONTROL;
  DrawTextW(context.get(), wide(text), -1, &place, format);
  return static_cast<int>(place.bottom);
}

}  // namespace talutil::win32
