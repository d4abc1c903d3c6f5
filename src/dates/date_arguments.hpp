#pragma once

#include "automation/variant.hpp"

/// How the date members read their arguments and write their texts.
namespace talutil {

/// Null, Empty and the empty text: what the members have defaults for. Raises 13 for an error value or an array.
[[nodiscard]] bool is_missing_date(const Variant& argument, const Locale& locale);

/// The date of an argument that a member formats before all else. Raises 13 for what formats to no date: a text
/// that is none, and Null, which formats to an empty text.
[[nodiscard]] Date formatted_date(const Variant& argument, const Locale& locale);

/// A text that a member has put together, in a pattern. One that is no date (31/2/2009, a year beyond 9999) stays
/// as it is, as the platform's formatter has it.
[[nodiscard]] Text reformatted(const Text& text, TextView pattern, const Locale& locale);

/// "day/month/year", each in its shortest form.
[[nodiscard]] Text short_date_text(std::int32_t day, std::int32_t month, std::int32_t year);

/// Minutes as "hours:minutes", each in its shortest form and with the sign of the whole.
[[nodiscard]] Text hours_and_minutes_text(std::int32_t minutes);

/// Hours and minutes as minutes. Raises 6 beyond 32 bits.
[[nodiscard]] std::int32_t in_minutes(std::int32_t hours, std::int32_t minutes);

inline constexpr TextView date_pattern = u"DD/MM/YYYY";
inline constexpr TextView date_and_time_pattern = u"DD/MM/YYYY HH:MM";
inline constexpr TextView time_pattern = u"HH:MM";

}  // namespace talutil
