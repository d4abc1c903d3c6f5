#include "automation/date.hpp"

#include <algorithm>
#include <chrono>
#include <cmath>

#include "automation/checked.hpp"
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

/// A date to the second, in numbers that increase with time.
struct DayAndSecond {
  std::int32_t day;  ///< Relative to day 0.
  std::int32_t second;

  [[nodiscard]] std::int64_t seconds() const noexcept { return std::int64_t{day} * seconds_in_day + second; }
};

DayAndSecond count_of(Date date) {
  const double days = to_date_checked(date.days).days;
  const auto day = static_cast<std::int32_t>(days);
  const auto second = static_cast<std::int32_t>(std::lround(std::abs(days - day) * seconds_in_day));
  if (second == seconds_in_day) return {day + 1, 0};
  return {day, second};
}

Date date_of(const DayAndSecond& count) noexcept {
  const double time = static_cast<double>(count.second) / seconds_in_day;
  return {count.day < 0 ? count.day - time : count.day + time};
}

/// Raises 5 if out of range.
Date date_of_seconds(std::int64_t seconds) {
  const std::int64_t second = (seconds % seconds_in_day + seconds_in_day) % seconds_in_day;
  const std::int64_t day = (seconds - second) / seconds_in_day;
  if (day < first_day || day > last_day) raise(ErrorNumber::invalid_procedure_call);
  return date_of({static_cast<std::int32_t>(day), static_cast<std::int32_t>(second)});
}

chrono::year_month_day calendar_of(std::int32_t day) noexcept { return day_zero + chrono::days{day}; }

/// Months since the year 0.
std::int64_t months_of(std::int64_t year, std::int64_t month) noexcept { return year * 12 + month - 1; }

/// Raises 5 for a month far from any valid date. Days and hours of 16 bits reach back a little less than 94 years.
chrono::year_month month_of(std::int64_t months) {
  if (months < 0 || months > months_of(last_year + 94, 12)) raise(ErrorNumber::invalid_procedure_call);
  const auto month = static_cast<unsigned>(months % 12);
  return chrono::year{static_cast<int>(months / 12)} / chrono::month{month + 1};
}

std::int64_t days_until(chrono::sys_days day) noexcept { return (day - day_zero).count(); }

Date add_months(std::int64_t months, Date date) {
  const DayAndSecond count = count_of(date);
  const chrono::year_month_day calendar = calendar_of(count.day);
  const chrono::year_month month =
      month_of(months_of(static_cast<int>(calendar.year()), static_cast<unsigned>(calendar.month())) + months);
  const chrono::day last = (month / chrono::last).day();
  return date_of_seconds(days_until(month / std::min(calendar.day(), last)) * seconds_in_day + count.second);
}

constexpr std::int32_t seconds_of(DateInterval interval) noexcept {
  switch (interval) {
    case DateInterval::hour:
      return 60 * 60;
    case DateInterval::minute:
      return 60;
    case DateInterval::second:
      return 1;
    default:
      return seconds_in_day;
  }
}

/// The number of the interval that contains a date, from a common origin.
std::int64_t place_of(DateInterval interval, Date date) {
  const DayAndSecond count = count_of(date);
  const chrono::year_month_day calendar = calendar_of(count.day);
  const auto year = static_cast<int>(calendar.year());
  if (interval == DateInterval::year) return year;
  if (interval == DateInterval::month) return months_of(year, static_cast<unsigned>(calendar.month()));
  const std::int32_t unit = seconds_of(interval);
  return std::int64_t{count.day} * (seconds_in_day / unit) + count.second / unit;
}

}  // namespace

bool is_in_date_range(double days) noexcept {
  // The last half second would round up to the year 10000.
  return days > first_day - 1 && days < last_day + (seconds_in_day - 0.5) / seconds_in_day;
}

Date to_date_checked(double days) {
  if (!is_in_date_range(days)) raise(ErrorNumber::overflow);
  return {days};
}

DateParts parts_of(Date date) {
  const DayAndSecond count = count_of(date);
  const chrono::year_month_day calendar = calendar_of(count.day);
  return {.year = static_cast<int>(calendar.year()),
          .month = static_cast<std::int32_t>(static_cast<unsigned>(calendar.month())),
          .day = static_cast<std::int32_t>(static_cast<unsigned>(calendar.day())),
          .hour = count.second / 3600,
          .minute = count.second / 60 % 60,
          .second = count.second % 60};
}

std::optional<Date> date_from_parts(const DateParts& parts) noexcept {
  const auto is_within = [](std::int32_t value, std::int32_t first, std::int32_t last) {
    return value >= first && value <= last;
  };
  const bool is_time = is_within(parts.hour, 0, 23) && is_within(parts.minute, 0, 59) && is_within(parts.second, 0, 59);
  const bool is_day =
      is_within(parts.year, first_year, last_year) && is_within(parts.day, 1, days_in_month(parts.month, parts.year));
  if (!is_time || !is_day) return {};
  const std::int64_t day = days_until(chrono::year{parts.year} / parts.month / parts.day);
  return date_of({static_cast<std::int32_t>(day), parts.hour * 3600 + parts.minute * 60 + parts.second});
}

Date date_from_serial(std::int32_t year, std::int32_t month, std::int32_t day, std::int32_t second) {
  if (year < 0) raise(ErrorNumber::invalid_procedure_call);
  const std::int64_t first = days_until(month_of(months_of(full_year(year), month)) / 1);
  return date_of_seconds((first + day - 1) * seconds_in_day + second);
}

Date day_of(Date date) { return date_of({count_of(date).day, 0}); }

std::int32_t day_of_year(Date date) {
  const std::int32_t day = count_of(date).day;
  const std::int64_t new_year = days_until(calendar_of(day).year() / chrono::January / 1);
  return static_cast<std::int32_t>(day - new_year + 1);
}

std::strong_ordering compare_dates(Date a, Date b) { return count_of(a).seconds() <=> count_of(b).seconds(); }

Date date_add(DateInterval interval, std::int32_t count, Date date) {
  if (interval == DateInterval::year) return add_months(std::int64_t{count} * 12, date);
  if (interval == DateInterval::month) return add_months(count, date);
  return date_of_seconds(count_of(date).seconds() + std::int64_t{count} * seconds_of(interval));
}

std::int32_t date_difference(DateInterval interval, Date from, Date to) {
  return checked_cast<std::int32_t>(place_of(interval, to) - place_of(interval, from));
}

bool is_leap_year(std::int32_t year) noexcept { return year % 4 == 0 && (year % 100 != 0 || year % 400 == 0); }

std::int32_t days_in_month(std::int32_t month, std::int32_t year) noexcept {
  constexpr std::int32_t days[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  if (month < 1 || month > 12) return 0;
  return month == 2 && is_leap_year(year) ? 29 : days[month - 1];
}

}  // namespace talutil
