#pragma once

#include <cstdint>

namespace talutil {

/// The platform's broken-down time, field for field as the type library publishes it.
struct SystemTime {
  std::int16_t wYear = 0;
  std::int16_t wMonth = 0;
  std::int16_t wDayOfWeek = 0;
  std::int16_t wDay = 0;
  std::int16_t wHour = 0;
  std::int16_t wMinute = 0;
  std::int16_t wSecond = 0;
  std::int16_t wMilliseconds = 0;
  friend constexpr bool operator==(const SystemTime&, const SystemTime&) noexcept = default;
};

}  // namespace talutil
