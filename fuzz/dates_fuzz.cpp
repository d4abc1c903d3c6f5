// Checks what must hold for any text that is read as a date or duration: dates_fuzz -max_len=40 -runs=10000000

#include <algorithm>
#include <cmath>

#include "automation/date.hpp"
#include "automation/run_time_error.hpp"
#include "fuzz/host.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

constexpr std::int32_t current_year = 2009;

using fuzz::require;

/// Maps most bytes to elements of dates, including whole words, so that many texts are dates.
Text text_of(const std::uint8_t* data, std::size_t size) {
  constexpr TextView pieces[] = {u"0",  u"1",  u"2",   u"3",   u"4",   u"5",    u"9",   u"12", u"31",   u"20", u"1999",
                                 u"/",  u"/",  u"-",   u".",   u",",   u":",    u":",   u" ",  u" ",    u"\t", u"Mar",
                                 u"am", u"PM", u"feb", u"dec", u"may", u"sept", u"29/", u"2/", u"/100", u"x"};
  Text text;
  for (const std::uint8_t* at = data; at != data + size; ++at) {
    if (*at < 224)
      text += pieces[*at % std::size(pieces)];
    else
      text += static_cast<char16_t>((*at - 224) * 0x83 + (at == data ? 0 : at[-1]));
  }
  return text;
}

void check(const Text& text) {
  const auto date = text_to_date(text, current_year);
  require(text_to_date(u" " + text + u"\t", current_year) == date, "blanks around do not matter");
  Text capitals = text;
  for (char16_t& unit : capitals) unit = unit >= u'a' && unit <= u'z' ? static_cast<char16_t>(unit - 0x20) : unit;
  require(text_to_date(capitals, current_year) == date, "the case of letters does not matter");
  if (!date) return;

  require(is_in_date_range(date->days), "a date is in range");
  const DateParts parts = parts_of(*date);
  require(date_from_parts(parts) == date, "a date is a whole number of seconds");
  require(text_to_date(date_to_text(*date), current_year) == date, "the plain text is read as the same date");
  require(text_to_date(format_date(*date, u"YYYY-MM-DD h:n:s"), current_year) == date, "and so is the ISO form");

  require(compare_dates(*date, date_from_serial(parts.year, parts.month, parts.day, 0)) >= 0, "its day begins before");
  require(date_difference(DateInterval::day, day_of(*date), *date) == 0, "its day is the same");
  require(day_of_year(*date) >= 28 * (parts.month - 1) + parts.day, "its day of the year");
}

/// Calls a member; returns nothing if it raises one of the errors of conversions.
template <class Call>
std::optional<Variant> answer_of(Call call) {
  try {
    return Variant(call());
  } catch (const RunTimeError& error) {
    require(error.number() == 5 || error.number() == 6 || error.number() == 13, "an error of conversions");
    return std::nullopt;
  }
}

void check_durations(const Text& text) {
  static fuzz::Host host;
  ORVUtils& utils = host.utils();
  const auto time = answer_of([&] { return utils.DurationToDateTime(text); });
  if (time) {
    Variant stored = *time;
    const std::int32_t minutes = utils.ConvertDatabaseDurationToMinutes(stored);
    const std::int32_t minutes_of_day = utils.ConvertTimeToMinutes(*time);
    require((minutes - minutes_of_day) % 1440 == 0, "a duration has its minutes");
    const Variant words = utils.DateTimeToDuration(stored);
    if (minutes == minutes_of_day) require(utils.DurationToDateTime(words) == *time, "within a day it comes back");
  }
  const float hours = utils.ConvertDurationToNumber(text);
  require(hours >= 0 && hours < 24, "hours of a day");
  Text typed = text;
  (void)answer_of([&] { return utils.DurToTime(typed); });
  require(typed == trim_blanks(text), "a duration is written back trimmed");
  for (Variant value : {Variant(text), Variant(text_to_date(text, current_year).value_or(Date{}))}) {
    (void)answer_of([&] { return utils.DateTimeToDuration(value); });
    (void)answer_of([&] { return utils.ConvertDatabaseDurationToNumber(value); });
    (void)answer_of([&] { return utils.ConvertDatabaseDurationToMinutes(value); });
  }
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const talutil::Text text = talutil::text_of(data, size);
  talutil::check(text);
  talutil::check_durations(text);
  return 0;
}
