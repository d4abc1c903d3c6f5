#pragma once

#include <compare>
#include <cstdint>
#include <optional>

#include "automation/text.hpp"

namespace talutil {

/// The automation date: days since 30 December 1899, the time of day as the fraction. Before that day the
/// whole part counts down while the fraction still counts up from midnight: -1.25 is 29 December 1899, 06:00.
struct Date {
  double days = 0;
  friend constexpr bool operator==(Date, Date) noexcept = default;
};

/// The parts of a date, to the second (rounded).
struct DateParts {
  std::int32_t year = 1899;
  std::int32_t month = 12;
  std::int32_t day = 30;
  std::int32_t hour = 0;
  std::int32_t minute = 0;
  std::int32_t second = 0;
  friend constexpr bool operator==(const DateParts&, const DateParts&) noexcept = default;
};

/// The range of automation dates: 1 January 100 to 31 December 9999, 23:59:59.
[[nodiscard]] bool is_in_date_range(double days) noexcept;

/// A number of days as a date. Raises 6 out of range.
[[nodiscard]] Date to_date_checked(double days);

/// Raises 6 for a date out of range.
[[nodiscard]] DateParts parts_of(Date date);

/// Parts of the Gregorian calendar as a date; empty when they name no date or time of day (31 February, 24:00).
[[nodiscard]] std::optional<Date> date_from_parts(const DateParts& parts) noexcept;

/// The date of a year, month and day, and a time of day in seconds, each of which may lie beyond its range:
/// month 13 is the next January, day 0 the last day of the month before, and a time beyond midnight another day.
/// Years of two digits are 1930 to 2029. Raises 5 for a negative year and where the result is out of range.
[[nodiscard]] Date date_from_serial(std::int32_t year, std::int32_t month, std::int32_t day, std::int32_t second);

/// Midnight of the day of a date. Raises 6 for a date out of range.
[[nodiscard]] Date day_of(Date date);

/// 1 for 1 January. Raises 6 for a date out of range.
[[nodiscard]] std::int32_t day_of_year(Date date);

/// Which of two dates is the earlier, to the second. (Before day 0 the numbers of days do not tell: they count
/// the time of day backwards.) Raises 6 for a date out of range.
[[nodiscard]] std::strong_ordering compare_dates(Date a, Date b);

/// The calendar's units, by which dates are moved and compared.
enum class DateInterval : std::uint8_t { year, month, day, hour, minute, second };

/// A date some intervals later, or earlier for a negative count. A month or year keeps the day of the month as
/// far as the month has it: 31 January and a month is the last of February. Raises 6 for a date out of range
/// and 5 where the result is.
[[nodiscard]] Date date_add(DateInterval interval, std::int32_t count, Date date);

/// How many boundaries of an interval lie between two dates; negative when `to` is the earlier. From 10:59 to
/// 11:00 is an hour, from 11:00 to 11:59 none. Raises 6 for a date out of range and beyond 32 bits.
[[nodiscard]] std::int32_t date_difference(DateInterval interval, Date from, Date to);

[[nodiscard]] bool is_leap_year(std::int32_t year) noexcept;
[[nodiscard]] std::int32_t days_in_month(std::int32_t month, std::int32_t year) noexcept;

/// Which year one of two digits means, 1930 to 2029; other years mean themselves.
[[nodiscard]] constexpr std::int32_t full_year(std::int32_t year) noexcept {
  if (year < 0 || year > 99) return year;
  return year < 30 ? 2000 + year : 1900 + year;
}

/// A text read as a date, day first: "5/3/2009", "05-03-09", "5 Mar 2009", "2009-03-05", each with or without
/// a time "13:45", "1:45:30 PM", or a time alone. Two-digit years are 1930 to 2029; a missing year is
/// `current_year`. Month and day change places where only that makes a date. Empty when it is no date.
[[nodiscard]] std::optional<Date> text_to_date(TextView text, std::int32_t current_year);

/// Plain text of a date: "05/03/2009" at midnight, "13:45" for a time alone (day 0), else "05/03/2009 13:45".
/// Seconds follow only where they are not 0, so that a whole-minute time ends in its "HH:MM".
[[nodiscard]] Text date_to_text(Date date);

/// A date in a pattern of the platform's, upper or lower case: d, m, h, n and s give the shortest number, doubled
/// two digits; yy gives two digits of the year and yyyy four, also of the year 100. "m" stands for minutes where
/// the part before it was the hour. All other characters stand for themselves. Raises 6 for a date out of range.
[[nodiscard]] Text format_date(Date date, TextView pattern);

}  // namespace talutil
