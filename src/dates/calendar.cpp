#include <algorithm>

#include "automation/checked.hpp"
#include "dates/date_arguments.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

constexpr TextView missing_date_text = u"01/01/1980";
constexpr TextView missing_time_text = u"01:30";
constexpr Date missing_date{29221};  ///< 1 January 1980.

/// The parts of a date; nothing if it is missing.
std::optional<DateParts> parts_if_given(const Variant& argument, const Locale& locale) {
  const Variant value = argument.value();
  if (is_missing_date(value, locale)) return {};
  return parts_of(value.to_date(locale));
}

/// The value of an argument that is never rejected: if it has none, Null.
Variant value_or_null(const Variant& argument) {
  try {
    return argument.value();
  } catch (const RunTimeError&) {
    return Null{};
  }
}

/// The date of a value; nothing for Null, Empty, numbers and anything else that is not a date.
std::optional<Date> date_if_any(const Variant& value, const Locale& locale) {
  if (!value.is_date(locale)) return {};
  try {
    return to_date_checked(value.to_date(locale).days);
  } catch (const RunTimeError&) {
    return {};
  }
}

bool is_text(const Variant& value, TextView text) {
  const auto* const held = value.get_if<Text>();
  return held != nullptr && *held == text;
}

/// The text for a date that is not missing; empty for 1 January 1980 and earlier, except that mode 3 returns the
/// current time for that day.
Text shown_date(std::int16_t mode, Date date, Clock& clock) {
  // Compared as displayed: without the time of day, or without seconds in mode 2.
  const bool shows_time = mode == 2;
  const Date first_shown = date_add(shows_time ? DateInterval::minute : DateInterval::day, 1, missing_date);
  if (std::is_gteq(compare_dates(date, first_shown))) {
    return format_date(date, shows_time ? date_and_time_pattern : date_pattern);
  }
  const bool is_missing_day = std::is_gteq(compare_dates(date, missing_date));
  return mode == 3 && is_missing_day ? format_date(clock.now(), date_and_time_pattern) : Text();
}

}  // namespace

std::int16_t ORVUtils::GetYear(const Variant& vDate) {
  const auto parts = parts_if_given(vDate, locale());
  return static_cast<std::int16_t>(parts ? parts->year : 2000);
}

std::int16_t ORVUtils::GetMonth(const Variant& vDate) {
  const auto parts = parts_if_given(vDate, locale());
  return static_cast<std::int16_t>(parts ? parts->month : 1);
}

std::int16_t ORVUtils::GetDay(const Variant& vDate) {
  const auto parts = parts_if_given(vDate, locale());
  return static_cast<std::int16_t>(parts ? parts->day : 1);
}

std::int16_t ORVUtils::GetDaysThisMonth(const std::int16_t& iMonth, const std::int16_t& iYear) {
  if (iMonth == 0 || iYear == 0) return 28;
  if (iMonth < 1 || iMonth > 12) raise(ErrorNumber::subscript_out_of_range);
  return static_cast<std::int16_t>(days_in_month(iMonth, iYear));
}

Variant ORVUtils::SetDayOfMonth(const Variant& vDate, const std::int16_t& iDayNumber) {
  const DateParts parts = parts_of(vDate.to_date(locale()));
  return reformatted(short_date_text(iDayNumber, parts.month, parts.year), date_pattern, locale());
}

Text ORVUtils::GetFinancialYearStr(const Variant& vDate) {
  const DateParts parts = parts_of(formatted_date(vDate, locale()));
  const std::int32_t first = parts.year % 100 - (parts.month < 7 ? 1 : 0);
  // Centuries do not wrap: 99 is followed by 100, and 00 is preceded by -1, which already has two characters.
  const auto two_characters = [](std::int32_t year) {
    const Text text = number_to_text(year);
    return text.size() == 1 ? u"0" + text : text;
  };
  return two_characters(first) + two_characters(first + 1);
}

Variant ORVUtils::VerifyNullTime(const std::int16_t& /*iFlag*/, const Variant& vTime) {
  settings().CounterVerifyTime = checked_add(settings().CounterVerifyTime, 1);
  const auto time = date_if_any(value_or_null(vTime), locale());
  // A missing time has the same default in every mode, so the mode makes no difference.
  return time ? format_date(*time, time_pattern) : Text(missing_time_text);
}

Variant ORVUtils::VerifyNullDate(const std::int16_t& iFlag, Variant& vDate) {
  settings().CounterVerifyDate = checked_add(settings().CounterVerifyDate, 1);
  Variant value = value_or_null(vDate);
  if (is_text(value, u"00:00:00")) vDate = value = missing_date_text;
  const auto date = date_if_any(value, locale());
  Text shown;
  if (date) shown = shown_date(iFlag, *date, library().platform().clock);
  if (iFlag == 1 && shown.empty()) shown = missing_date_text;
  if (iFlag == 4 && !shown.empty()) shown = reformatted(shown, u"DDMMYYYY", locale());
  // A date rather than a text for anything missing, in every mode: hosts distinguish the two.
  if (!date || std::is_lteq(compare_dates(*date, missing_date))) return missing_date;
  return shown;
}

Variant ORVUtils::GetDateFromString(const Text& sText) {
  constexpr std::size_t length = 8;
  if (sText.size() != length || !std::ranges::all_of(sText, is_decimal_digit)) return u"";
  const auto number = [&](std::size_t at, std::size_t count) {
    return static_cast<std::int16_t>(leading_number(TextView(sText).substr(at, count)));
  };
  const std::int16_t year = number(4, 4);
  const std::int16_t month = number(2, 2);
  const std::int16_t day = number(0, 2);
  if (year < 1900 || year > 2100 || month < 1 || month > 12) return u"";
  if (day < 1 || day > GetDaysThisMonth(month, year)) return u"";
  return sText.substr(0, 2) + u"/" + sText.substr(2, 2) + u"/" + sText.substr(4);
}

}  // namespace talutil
