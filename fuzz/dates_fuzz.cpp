// Checks what must hold for any date, and any text that is read as one or as a duration: dates_fuzz -max_len=64
// -runs=10000000

#include <algorithm>
#include <chrono>
#include <cmath>

#include "automation/date.hpp"
#include "automation/run_time_error.hpp"
#include "fuzz/host.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

constexpr std::int32_t current_year = 2009;
constexpr std::int32_t first_day = -657434;
constexpr std::int32_t last_day = 2958465;

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

  const Date midnight = date_from_serial(parts.year, parts.month, parts.day, 0);
  require(std::is_gteq(compare_dates(*date, midnight)), "its day begins before");
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

constexpr std::chrono::sys_days day_0 = std::chrono::year(1899) / std::chrono::December / 30;

/// A day and a second of it as a number; before day 0 the time counts away from it.
double serial_of(std::int32_t day, std::int32_t second) { return day + (day < 0 ? -second : second) / 86400.0; }

/// Any day there is; one in eight lies near the first or the last.
std::int32_t any_day(fuzz::Input& input) {
  const std::int32_t kind = input.whole(0, 15);
  return input.whole(kind == 1 ? last_day - 800 : first_day, kind == 0 ? first_day + 800 : last_day);
}

void check_parts(fuzz::Input& input) {
  using namespace std::chrono;
  const std::int32_t day = any_day(input);
  const std::int32_t second = input.whole(0, 86399);
  const year_month_day date(day_0 + days(day));
  const DateParts parts{int(date.year()),          int(unsigned(date.month())),
                        int(unsigned(date.day())), second / 3600,
                        second / 60 % 60,          second % 60};
  require(parts_of({serial_of(day, second)}) == parts, "the parts of a date");
  require(std::abs(date_from_parts(parts).value().days - serial_of(day, second)) < 1e-9, "the date of its parts");
  // Parts beyond their ranges count on.
  const std::int32_t more_months = input.whole(-40, 40);
  const std::int32_t more_days = input.whole(-500, 500);
  const std::int32_t more_seconds = input.whole(0, 200'000);
  const sys_days first = date.year() / date.month() / 1 + months(more_months);
  const sys_seconds moved = first + days(parts.day - 1 + more_days) + seconds(second + more_seconds);
  const auto count = static_cast<std::int32_t>((floor<days>(moved) - day_0).count());
  const auto rest = static_cast<std::int32_t>((moved - floor<days>(moved)).count());
  const auto date_of_parts = answer_of([&] {
    return date_from_serial(parts.year, parts.month + more_months, parts.day + more_days, second + more_seconds);
  });
  require(date_of_parts.has_value() == (count >= first_day && count <= last_day), "parts within the calendar");
  require(
      !date_of_parts || date_to_text(date_of_parts->to_date(plain_numbers)) == date_to_text({serial_of(count, rest)}),
      "parts beyond their ranges");
}

/// Days and months in a period, compared with differences.
void check_period(fuzz::Input& input) {
  static fuzz::Host host;
  const Date a{static_cast<double>(any_day(input))};
  const Date b{a.days + (input.whole(0, 9) == 0 ? input.whole(-3000, 3000) : input.whole(-70, 70))};
  if (!is_in_date_range(b.days)) return;
  const auto months_of = [](Date date) { return parts_of(date).year * 12 + parts_of(date).month; };
  // The day behind the last one is looked at too, unless there is but one.
  const bool is_refused = a != b && std::max(a.days, b.days) == last_day;
  const auto expected = [&](double count) {
    return is_refused ? std::nullopt
                      : std::optional<Variant>(static_cast<std::int32_t>(a == b ? count : std::abs(count)));
  };
  require(answer_of([&] { return host.utils().GetDaysInPeriod(a, b); }) == expected(b.days - a.days),
          "GetDaysInPeriod");
  const auto months = answer_of([&] { return host.utils().GetMonthsInPeriod(a, b); });
  require(months == expected(a == b ? -1 : months_of(b) - months_of(a)), "GetMonthsInPeriod");
}

Text text_of(const std::chrono::year_month_day& date) {
  const Text text = number_to_text(int(unsigned(date.day()))) + u"/" + number_to_text(int(unsigned(date.month()))) +
                    u"/" + number_to_text(int(date.year()));
  const auto known = text_to_date(text, current_year);
  return known ? date_to_text(*known) : text;
}

/// Days and months later, compared with the calendar.
void check_steps(fuzz::Input& input) {
  using namespace std::chrono;
  static fuzz::Host host;
  const std::int32_t start = any_day(input);
  const std::int32_t most = input.whole(0, 99) == 0 ? 32767 : 1200;
  const auto count = static_cast<std::int16_t>(input.whole(-most, most));
  const Date from{static_cast<double>(start)};
  const year_month_day date(day_0 + days(start));
  const Text later = host.utils().IncDay(from, count).to_text(plain_numbers);
  require(later == text_of(day_0 + days(start + count)), "IncDay");
  const year_month month = date.year() / date.month() + months(count);
  // In the year 0 every month has 28 days.
  const auto last_day_of_month = int(month.year()) == 0 ? std::chrono::day(28) : (month / last).day();
  const Text months_later = host.utils().IncMonth(from, count).to_text(plain_numbers);
  require(months_later == text_of(month / std::min(date.day(), last_day_of_month)), "IncMonth");
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const talutil::Text text = talutil::text_of(data, size);
  talutil::check(text);
  talutil::check_durations(text);
  talutil::fuzz::Input input(data, size, u"");
  talutil::check_parts(input);
  talutil::check_period(input);
  talutil::check_steps(input);
  return 0;
}
