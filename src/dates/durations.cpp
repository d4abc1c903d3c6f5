#include <algorithm>

#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"
#include "dates/date_arguments.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

// A duration is stored as the date that is later than this by the duration.
constexpr TextView epoch_text = u"1/1/1800 00:00";
constexpr Date epoch{-36522};

constexpr float default_hours = 1.5F;

/// The full text of a stored duration. For a date it has both day and time, even if one of them is 0, and ends with
/// hours and minutes.
Text full_text(const Variant& value, const Locale& locale) {
  if (const auto* const date = value.get_if<Date>()) return format_date(*date, date_and_time_pattern);
  return value.to_text(locale);
}

/// The minutes of a stored duration. If its test text is on day 0 it is a bare time of day, as durations used to be
/// stored; the argument is then rewritten first.
std::int32_t stored_minutes(Variant& argument, Variant value, TextView test_text, const Locale& locale) {
  constexpr TextView day_zero = u"30/12/1899";
  constexpr std::size_t time_length = 5;
  if (test_text.starts_with(day_zero)) {
    const Text text = full_text(value, locale);
    argument = value = u"1/1/1800 " + text.substr(text.size() - std::min(text.size(), time_length));
  }
  return date_difference(DateInterval::minute, epoch, value.to_date(locale));
}

/// For members that format the value before testing it, texts without a day are also on day 0.
std::int32_t minutes_by_formatted_text(Variant& argument, const Locale& locale) {
  const Variant value = argument.value();
  const Text test_text = format_date(formatted_date(value, locale), date_and_time_pattern);
  return stored_minutes(argument, value, test_text, locale);
}

bool is_whole_number(TextView text) {
  if (text.starts_with(u'-')) text.remove_prefix(1);
  return !text.empty() && std::ranges::all_of(text, is_decimal_digit);
}

/// Whether a text is "hours:minutes" as members put it together: "1:30", "26:0", "0:-5". Only two characters are read
/// as minutes, so "-1:-30" is not one: it would lose its second sign.
bool is_hours_and_minutes(TextView text) {
  const std::size_t colon = text.find(u':');
  if (colon == TextView::npos || text.size() - colon > 3) return false;
  return is_whole_number(text.substr(0, colon)) && is_whole_number(text.substr(colon + 1));
}

/// The time of a duration as "HH:MM". Hours and minutes beyond a time of day (24:0 and more) are left unchanged.
Text time_text(const Variant& duration, const Locale& locale) {
  const Variant value = duration.value();
  const auto* const text = value.get_if<Text>();
  if (text != nullptr && is_hours_and_minutes(*text)) return reformatted(*text, time_pattern, locale);
  return format_date(formatted_date(value, locale), time_pattern);
}

/// The number before the first colon; 0 if there is none. Raises 6 beyond 32 bits.
std::int32_t hours_of(ORVUtils& utils, const Text& time) {
  const std::int32_t colon = utils.MyPos(u":", time, 1);
  if (colon < 1) return 0;
  return round_to<std::int32_t>(leading_number(TextView(time).substr(0, static_cast<std::size_t>(colon - 1))));
}

/// The number in the last two characters; 0 if they include the colon.
std::int32_t last_minutes(TextView time) {
  return static_cast<std::int32_t>(leading_number(time.substr(time.size() - std::min<std::size_t>(time.size(), 2))));
}

/// Decimal hours of "hours:minutes": only quarters of an hour count. Zero becomes an hour and a half.
float decimal_hours(ORVUtils& utils, const Text& time) {
  auto hours = static_cast<float>(hours_of(utils, time));
  const std::int32_t minutes = last_minutes(time);
  if (minutes == 15 || minutes == 30 || minutes == 45) hours += static_cast<float>(minutes) / 60;
  return hours == 0 ? default_hours : hours;
}

}  // namespace

Variant ORVUtils::DateTimeToDuration(Variant& vDate) {
  const Variant value = vDate.value();
  return hours_and_minutes_text(stored_minutes(vDate, value, full_text(value, locale()), locale()));
}

Variant ORVUtils::DurationToDateTime(const Variant& vDuration) {
  const Text time = time_text(vDuration, locale());
  const std::int32_t hours = hours_of(*this, time);
  return date_add(DateInterval::minute, in_minutes(hours, last_minutes(time)), epoch);
}

float ORVUtils::ConvertDurationToNumber(const Variant& vT) {
  try {
    const Text text = StringReplace(vT.to_text(locale()), u"-", u"0");
    return decimal_hours(*this, format_date(formatted_date(text, locale()), time_pattern));
  } catch (...) {
    // If it is not a time, the result is 0, not the default.
    return 0;
  }
}

Variant ORVUtils::DurToTime(Text& sDuration) {
  sDuration = Text(trim_blanks(sDuration));
  const std::int32_t point = MyPos(u".", sDuration, 1);
  if (point < 1) return DurationToDateTime(sDuration + u":0");
  Text hours = sDuration.substr(0, static_cast<std::size_t>(point - 1));
  Text minutes = sDuration.substr(static_cast<std::size_t>(point));
  if (trim_blanks(hours).empty()) hours = u"0";
  // Quarters of an hour, each in one spelling. Any other fraction has always been taken as minutes.
  constexpr TextView quarters[][2] = {{u"5", u"30"}, {u"25", u"15"}, {u"75", u"45"}};
  for (const auto& [fraction, in_minutes] : quarters) {
    if (minutes == fraction) {
      minutes = in_minutes;
      break;
    }
  }
  return DurationToDateTime(hours + u":" + minutes);
}

Text ORVUtils::ConvertDatabaseDurationToNumber(Variant& vDuration) {
  float hours = decimal_hours(*this, hours_and_minutes_text(minutes_by_formatted_text(vDuration, locale())));
  // No job has ever taken more than a day: it counts as an hour.
  if (hours > 24) hours = 1;
  return number_to_text(hours, locale());
}

Variant ORVUtils::ConvertNumberToDatabaseDuration(const std::int16_t& iMinutes) {
  try {
    return DurationToDateTime(hours_and_minutes_text(iMinutes));
  } catch (...) {
    library().platform().message_boxes.show(
        u"ORVUtils ConvertNumberToDatabaseDuration " + current_error().description(), MessageButtons::ok, {});
    return epoch_text;
  }
}

std::int32_t ORVUtils::ConvertDatabaseDurationToMinutes(Variant& vDuration) {
  return minutes_by_formatted_text(vDuration, locale());
}

std::int32_t ORVUtils::ConvertTimeToMinutes(const Variant& vTime) {
  const DateParts time = parts_of(formatted_date(vTime, locale()));
  return in_minutes(time.hour, time.minute);
}

}  // namespace talutil
