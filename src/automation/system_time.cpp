#include "automation/system_time.hpp"

#include <chrono>

namespace talutil {

namespace {

namespace chrono = std::chrono;

constexpr chrono::sys_days first_day = chrono::year{1601} / chrono::January / 1;
constexpr std::int32_t last_year = 30827;
constexpr FileTime file_time_millisecond = file_time_second / 1000;
constexpr FileTime file_time_day = 24 * 60 * 60 * file_time_second;

bool is_time_of_day(const SystemTime& time) noexcept {
  const auto is_below = [](std::int16_t value, std::int16_t limit) { return value >= 0 && value < limit; };
  return is_below(time.wHour, 24) && is_below(time.wMinute, 60) && is_below(time.wSecond, 60) &&
         is_below(time.wMilliseconds, 1000);
}

}  // namespace

std::optional<FileTime> system_to_file_time(const SystemTime& time) noexcept {
  if (time.wYear < 1601 || time.wYear > last_year || time.wMonth < 1 || time.wDay < 1 || !is_time_of_day(time))
    return {};
  const chrono::year_month_day day{chrono::year{time.wYear}, chrono::month{static_cast<unsigned>(time.wMonth)},
                                   chrono::day{static_cast<unsigned>(time.wDay)}};
  if (!day.ok()) return {};
  const std::int64_t days = (chrono::sys_days(day) - first_day).count();
  const std::int64_t seconds = (time.wHour * 60 + time.wMinute) * 60 + time.wSecond;
  return days * file_time_day + seconds * file_time_second + time.wMilliseconds * file_time_millisecond;
}

std::optional<SystemTime> file_to_system_time(FileTime time) noexcept {
  if (time < 0) return {};
  const chrono::sys_days day = first_day + chrono::days{time / file_time_day};
  const chrono::year_month_day calendar{day};
  const FileTime of_day = time % file_time_day;
  const FileTime second = of_day / file_time_second;
  const auto part = [](auto value) { return static_cast<std::int16_t>(value); };
  return SystemTime{.wYear = part(static_cast<int>(calendar.year())),
                    .wMonth = part(static_cast<unsigned>(calendar.month())),
                    .wDayOfWeek = part(chrono::weekday{day}.c_encoding()),
                    .wDay = part(static_cast<unsigned>(calendar.day())),
                    .wHour = part(second / 3600),
                    .wMinute = part(second / 60 % 60),
                    .wSecond = part(second % 60),
                    .wMilliseconds = part(of_day % file_time_second / file_time_millisecond)};
}

}  // namespace talutil
