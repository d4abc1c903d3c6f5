#include "automation/date.hpp"

#include <chrono>
#include <cmath>

#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

namespace chrono = std::chrono;

constexpr chrono::sys_days day_zero = chrono::year{1899} / chrono::December / 30;
constexpr std::int32_t first_year = 100;
constexpr std::int32_t last_year = 9999;
constexpr std::int32_t first_day = (chrono::sys_days(chrono::year{first_year} / 1 / 1) - day_zero).count();
constexpr std::int32_t last_day = (chrono::sys_days(chrono::year{last_year} / 12 / 31) - day_zero).count();
constexpr std::int32_t seconds_in_day = 24 * 60 * 60;

}  // namespace

bool is_in_date_range(double days) noexcept {
  // The last half second would round to the year 10000.
  return days > first_day - 1 && days < last_day + (seconds_in_day - 0.5) / seconds_in_day;
}

Date to_date_checked(double days) {
  if (!is_in_date_range(days)) raise(ErrorNumber::overflow);
  return {days};
}

DateParts parts_of(Date date) {
  const double days = to_date_checked(date.days).days;
  auto day = static_cast<std::int32_t>(days);
  auto second = static_cast<std::int32_t>(std::lround(std::abs(days - day) * seconds_in_day));
  if (second == seconds_in_day) {
    ++day;
    second = 0;
  }
  const chrono::year_month_day calendar{day_zero + chrono::days{day}};
  return {.year = static_cast<int>(calendar.year()),
          .month = static_cast<std::int32_t>(static_cast<unsigned>(calendar.month())),
          .day = static_cast<std::int32_t>(static_cast<unsigned>(calendar.day())),
          .hour = second / 3600,
          .minute = second / 60 % 60,
          .second = second % 60};
}

std::optional<Date> date_from_parts(const DateParts& parts) noexcept {
  const auto is_within = [](std::int32_t value, std::int32_t first, std::int32_t last) {
    return value >= first && value <= last;
  };
  const bool is_time = is_within(parts.hour, 0, 23) && is_within(parts.minute, 0, 59) && is_within(parts.second, 0, 59);
  const bool is_day =
      is_within(parts.year, first_year, last_year) && is_within(parts.day, 1, days_in_month(parts.month, parts.year));
  if (!is_time || !is_day) return {};
  const chrono::sys_days calendar = chrono::year{parts.year} / parts.month / parts.day;
  const auto day = static_cast<std::int32_t>((calendar - day_zero).count());
  const double time = static_cast<double>(parts.hour * 3600 + parts.minute * 60 + parts.second) / seconds_in_day;
  return Date{day < 0 ? day - time : day + time};
}

bool is_leap_year(std::int32_t year) noexcept { return year % 4 == 0 && (year % 100 != 0 || year % 400 == 0); }

std::int32_t days_in_month(std::int32_t month, std::int32_t year) noexcept {
  constexpr std::int32_t days[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  if (month < 1 || month > 12) return 0;
  return month == 2 && is_leap_year(year) ? 29 : days[month - 1];
}

}  // namespace talutil
