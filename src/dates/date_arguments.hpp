#pragma once

#include "automation/variant.hpp"

/// How date members read their arguments and format their results.
namespace talutil {

/// True for Null, Empty and the empty text, for which members have defaults. Raises 13 for an error value or an array.
[[nodiscard]] bool is_missing_date(const Variant& argument, const Locale& locale);

/// The date of an argument that a member formats first. Raises 13 if the formatted argument is not a date: for a text
/// that is not one, and for Null, which is formatted as an empty text.
[[nodiscard]] Date formatted_date(const Variant& argument, const Locale& locale);

/// Reformats a text that a member has put together. If it is not a date (31/2/2009, a year beyond 9999), it is returned
/// unchanged, as by the platform's formatter.
[[nodiscard]] Text reformatted(const Text& text, TextView pattern, const Locale& locale);

/// "day/month/year", each in shortest form.
[[nodiscard]] Text short_date_text(std::int32_t day, std::int32_t month, std::int32_t year);

/// Minutes as "hours:minutes", each in shortest form and with the sign of the total.
[[nodiscard]] Text hours_and_minutes_text(std::int32_t minutes);

/// Hours and minutes in minutes. Raises 6 beyond 32 bits.
[[nodiscard]] std::int32_t in_minutes(std::int32_t hours, std::int32_t minutes);

inline constexpr TextView date_pattern = u"DD/MM/YYYY";
inline constexpr TextView date_and_time_pattern = u"DD/MM/YYYY HH:MM";
inline constexpr TextView time_pattern = u"HH:MM";

}  // namespace talutil
