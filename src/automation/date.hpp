#pragma once

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

[[nodiscard]] bool is_leap_year(std::int32_t year) noexcept;
[[nodiscard]] std::int32_t days_in_month(std::int32_t month, std::int32_t year) noexcept;

/// A text read as a date, day first: "5/3/2009", "05-03-09", "5 Mar 2009", "2009-03-05", each with or without
/// a time "13:45", "1:45:30 PM", or a time alone. Two-digit years are 1930 to 2029; a missing year is
/// `current_year`. Month and day change places where only that makes a date. Empty when it is no date.
[[nodiscard]] std::optional<Date> text_to_date(TextView text, std::int32_t current_year);

/// Plain text of a date: "05/03/2009" at midnight, "13:45" for a time alone (day 0), else "05/03/2009 13:45".
/// Seconds follow only where they are not 0, so that a whole-minute time ends in its "HH:MM".
[[nodiscard]] Text date_to_text(Date date);

}  // namespace talutil
