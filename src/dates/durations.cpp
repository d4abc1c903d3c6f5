#include <algorithm>

#include "automation/run_time_error.hpp"
#include "dates/date_arguments.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

// Durations are stored as dates that much later than this one.
constexpr TextView epoch_text = u"1/1/1800 00:00";
constexpr Date epoch{-36522};

constexpr float default_hours = 1.5F;

/// The text of a stored duration in full: of a date, day and time even where one of them is 0, with hours and
/// minutes at the end.
Text full_text(const Variant& value, const Locale& locale) {
  if (const auto* const date = value.get_if<Date>()) return format_date(*date, date_and_time_pattern);
  return value.to_text(locale);
}

/// Rewrites an argument that holds a bare time of day, as durations were stored once.
void rewrite_legacy(Variant& argument, const Text& test_text, const Text& full_text) {
  constexpr TextView day_zero = u"30/12/1899";
  if (!test_text.starts_with(day_zero)) return;
  constexpr std::size_t time_length = 5;
  const std::size_t tail = full_text.size() - std::min(full_text.size(), time_length);
  argument = u"1/1/1800 " + full_text.substr(tail);
}

std::int32_t minutes_since_epoch(const Variant& duration, const Locale& locale) {
  return date_difference(DateInterval::minute, epoch, duration.to_date(locale));
}

/// Legacy durations are known here by their formatted text, texts without a day included.
std::int32_t minutes_of(Variant& duration, const Locale& locale) {
  const Variant value = duration.value();
  const Text test_text = format_date(formatted_date(value, locale), date_and_time_pattern);
  rewrite_legacy(duration, test_text, full_text(value, locale));
  return minutes_since_epoch(duration, locale);
}

/// The number before the first colon; 0 where there is none.
std::int32_t hours_of(ORVUtils& utils, const Text& time) {
  const std::int32_t colon = utils.MyPos(u":", time, 1);
  if (colon < 1) return 0;
  return static_cast<std::int32_t>(leading_number(TextView(time).substr(0, static_cast<std::size_t>(colon - 1))));
}

/// The number that the last two characters are; with the colon among them it is 0.
std::int32_t last_minutes(TextView time) {
  return static_cast<std::int32_t>(leading_number(time.substr(time.size() - std::min<std::size_t>(time.size(), 2))));
}

/// "hours:minutes" as decimal hours: only quarters of an hour count. None at all is an hour and a half.
float decimal_hours(ORVUtils& utils, const Text& time) {
  auto hours = static_cast<float>(hours_of(utils, time));
  const std::int32_t minutes = last_minutes(time);
  if (minutes == 15 || minutes == 30 || minutes == 45) hours += static_cast<float>(minutes) / 60;
  return hours == 0 ? default_hours : hours;
}

}  // namespace

Variant ORVUtils::DateTimeToDuration(Variant& vDate) {
  const Text text = full_text(vDate.value(), locale());
  rewrite_legacy(vDate, text, text);
  const std::int32_t minutes = minutes_since_epoch(vDate, locale());
  return hours_and_minutes_text(minutes / 60, minutes % 60);
}

Variant ORVUtils::DurationToDateTime(const Variant& vDuration) {
  const Text time = format_date(formatted_date(vDuration, locale()), time_pattern);
  const std::int32_t hours = hours_of(*this, time);
  return date_add(DateInterval::minute, hours * 60 + last_minutes(time), epoch);
}

float ORVUtils::ConvertDurationToNumber(const Variant& vT) {
  try {
    const Text text = StringReplace(vT.to_text(locale()), u"-", u"0");
    return decimal_hours(*this, format_date(formatted_date(text, locale()), time_pattern));
  } catch (const RunTimeError&) {
    // What is no time has no hours: 0, without the default.
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
  // Quarters of an hour, each written one way. Any other fraction has always been taken for minutes.
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
  const std::int32_t minutes = minutes_of(vDuration, locale());
  float hours = decimal_hours(*this, hours_and_minutes_text(minutes / 60, minutes % 60));
  // More than a day has never been a job: it counts as an hour.
  if (hours > 24) hours = 1;
  return number_to_text(hours, locale());
}

Variant ORVUtils::ConvertNumberToDatabaseDuration(const std::int16_t& iMinutes) {
  try {
    return DurationToDateTime(hours_and_minutes_text(iMinutes / 60, iMinutes % 60));
  } catch (const RunTimeError& error) {
    library().platform().message_boxes.show(u"ORVUtils ConvertNumberToDatabaseDuration " + error.description(),
                                            MessageButtons::ok, {});
    return epoch_text;
  }
}

std::int32_t ORVUtils::ConvertDatabaseDurationToMinutes(Variant& vDuration) { return minutes_of(vDuration, locale()); }

std::int32_t ORVUtils::ConvertTimeToMinutes(const Variant& vTime) {
  const DateParts time = parts_of(formatted_date(vTime, locale()));
  return time.hour * 60 + time.minute;
}

}  // namespace talutil
