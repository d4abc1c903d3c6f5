#pragma once

#include <compare>
#include <cstdint>
#include <optional>

#include "automation/text.hpp"

namespace talutil {

/// The automation date: days since 30 December 1899, with the time of day as the fraction. For earlier dates the whole
/// part counts down while the fraction still counts up from midnight: -1.25 is 29 December 1899, 06:00.
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

/// Converts a number of days to a date. Raises 6 if out of range.
[[nodiscard]] Date to_date_checked(double days);

/// Raises 6 if the date is out of range.
[[nodiscard]] DateParts parts_of(Date date);

/// The date of parts in the Gregorian calendar; nothing if they are not a valid date or time of day (31 February,
/// 24:00).
[[nodiscard]] std::optional<Date> date_from_parts(const DateParts& parts) noexcept;

/// The date of a year, month, day, and time of day in seconds, each of which may be out of range: month 13 is the
/// following January, day 0 the last day of the previous month, and a time beyond midnight another day. Two-digit years
/// are 1930 to 2029. Raises 5 for a negative year and if the result is out of range.
[[nodiscard]] Date date_from_serial(std::int32_t year, std::int32_t month, std::int32_t day, std::int32_t second);

/// Midnight at the start of a date's day. Raises 6 if the date is out of range.
[[nodiscard]] Date day_of(Date date);

/// 1 for 1 January. Raises 6 if the date is out of range.
[[nodiscard]] std::int32_t day_of_year(Date date);

/// Compares two dates to the second. (Before day 0 the numbers of days cannot be compared directly, because the
/// fraction runs the other way.) Raises 6 if a date is out of range.
[[nodiscard]] std::strong_ordering compare_dates(Date a, Date b);

/// The units by which dates are moved and compared.
enum class DateInterval : std::uint8_t { year, month, day, hour, minute, second };

/// Moves a date by a number of intervals, backwards for a negative count. For months and years the day of the month
/// stays the same if the month has it: 31 January plus a month is the last of February. Raises 6 if the date is out of
/// range and 5 if the result is.
[[nodiscard]] Date date_add(DateInterval interval, std::int32_t count, Date date);

/// The number of interval boundaries between two dates; negative if `to` is earlier. From 10:59 to 11:00 is one hour,
/// from 11:00 to 11:59 none. Raises 6 if a date is out of range and beyond 32 bits.
[[nodiscard]] std::int32_t date_difference(DateInterval interval, Date from, Date to);

[[nodiscard]] bool is_leap_year(std::int32_t year) noexcept;
[[nodiscard]] std::int32_t days_in_month(std::int32_t month, std::int32_t year) noexcept;

/// Expands a two-digit year to 1930 to 2029; returns other years unchanged.
[[nodiscard]] constexpr std::int32_t full_year(std::int32_t year) noexcept {
  if (year < 0 || year > 99) return year;
  return year < 30 ? 2000 + year : 1900 + year;
}

/// Reads a text as a date, day first: "5/3/2009", "05-03-09", "5 Mar 2009", "2009-03-05", each with or without a time
/// "13:45", "1:45:30 PM", or a time alone. Two-digit years are 1930 to 2029; a missing year is `current_year`. Month
/// and day are swapped if only that makes a valid date. Returns nothing if the text is not a date.
[[nodiscard]] std::optional<Date> text_to_date(TextView text, std::int32_t current_year);

/// The plain text of a date: "05/03/2009" at midnight, "13:45" for a time alone (day 0), otherwise "05/03/2009 13:45".
/// Seconds are added only if they are not 0, so that a whole-minute time ends in "HH:MM".
[[nodiscard]] Text date_to_text(Date date);

/// Formats a date with one of the platform's patterns, in upper or lower case: d, m, h, n and s stand for the shortest
/// number, and doubled for two digits; yy is the year in two digits and yyyy in four, even for the year 100. "m" means
/// minutes if the preceding part is the hour. All other characters are copied. Raises 6 if the date is out of range.
[[nodiscard]] Text format_date(Date date, TextView pattern);

}  // namespace talutil
