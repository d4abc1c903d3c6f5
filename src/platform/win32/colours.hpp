#pragma once

#include <cstdint>

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// Converts a colour as hosts specify it: RGB, or a system colour's number with the highest bit set. An unknown number
/// becomes the colour of buttons.
inline COLORREF colour_of(std::int32_t colour) noexcept {
  const auto bits = static_cast<std::uint32_t>(colour);
  constexpr std::uint32_t system_colour = 0x80000000;
  if ((bits & system_colour) == 0) return bits & 0xFFFFFF;
  const auto index = static_cast<int>(bits & 0xFFFFFF);
  return GetSysColor(index <= COLOR_MENUBAR ? index : COLOR_BTNFACE);
}

/// Black or white, whichever contrasts more with a colour.
[[nodiscard]] inline COLORREF readable_on(COLORREF colour) noexcept {
  constexpr int middle = 128'000;
  const int brightness = GetRValue(colour) * 299 + GetGValue(colour) * 587 + GetBValue(colour) * 114;
  return brightness < middle ? RGB(255, 255, 255) : RGB(0, 0, 0);
}

}  // namespace talutil::win32
