#pragma once

#include <cstdint>
#include <optional>

namespace talutil {

/// The platform's broken-down time, with the fields that the type library publishes.
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

/// A point in time: intervals of 100 nanoseconds since 1 January 1601.
using FileTime = std::int64_t;

constexpr FileTime file_time_second = 10'000'000;

/// Returns nothing for invalid parts and for years outside 1601 to 30827. Ignores `wDayOfWeek`.
[[nodiscard]] std::optional<FileTime> system_to_file_time(const SystemTime& time) noexcept;

/// Returns nothing for a negative time.
[[nodiscard]] std::optional<SystemTime> file_to_system_time(FileTime time) noexcept;

}  // namespace talutil
