#include <algorithm>
#include <limits>

#include "automation/checked.hpp"
#include "dates/date_arguments.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

/// A day in the calendar of the stepping members: any 16-bit year, with the month lengths of GetDaysThisMonth.
struct CalendarDay {
  std::int32_t day;
  std::int16_t month;
  std::int16_t year;
};

CalendarDay calendar_day(const Variant& date, const Locale& locale) {
  const DateParts parts = parts_of(formatted_date(date, locale));
  return {parts.day, static_cast<std::int16_t>(parts.month), static_cast<std::int16_t>(parts.year)};
}

/// A two-digit year is expanded as in any text; with a year beyond 9999 the text stays as it was put together.
Variant date_text(const CalendarDay& date, const Locale& locale) {
  return reformatted(short_date_text(date.day, date.month, date.year), date_pattern, locale);
}

/// 16-bit counts are negated in 16 bits, which may overflow.
std::int32_t steps_of(std::int16_t count) { return count < 0 ? checked_subtract<std::int16_t>(0, count) : count; }

void to_next_month(CalendarDay& date) {
  ++date.month;
  if (date.month <= 12) return;
  date.month = 1;
  date.year = checked_add<std::int16_t>(date.year, 1);
}

void to_last_month(CalendarDay& date) {
  --date.month;
  if (date.month >= 1) return;
  date.month = 12;
  date.year = checked_subtract<std::int16_t>(date.year, 1);
}

/// Walks forward by a number of days, a month at a time. Months have at least `unasked` days, as if their length were
/// queried only after that day.
void walk_forward(ORVUtils& utils, CalendarDay& date, std::int32_t steps, std::int32_t unasked) {
  while (steps > 0) {
    const std::int32_t last = std::max<std::int32_t>(utils.GetDaysThisMonth(date.month, date.year), unasked);
    if (steps <= last - date.day) {
      date.day += steps;
      return;
    }
    steps -= std::max(last - date.day + 1, 1);
    date.day = 1;
    to_next_month(date);
  }
}

void walk_back(ORVUtils& utils, CalendarDay& date, std::int32_t steps) {
  while (steps > 0) {
    if (steps < date.day) {
      date.day -= steps;
      return;
    }
    steps -= std::max(date.day, 1);
    to_last_month(date);
    date.day = utils.GetDaysThisMonth(date.month, date.year);
  }
}

Variant step_days(ORVUtils& utils, const Variant& source, std::int16_t count, std::int32_t unasked) {
  CalendarDay date = calendar_day(source, utils.locale());
  const std::int32_t steps = steps_of(count);
  if (count < 0)
    walk_back(utils, date, steps);
  else
    walk_forward(utils, date, steps, unasked);
  return date_text(date, utils.locale());
}

void shorten_to_month(ORVUtils& utils, CalendarDay& date) {
  date.day = std::min<std::int32_t>(date.day, utils.GetDaysThisMonth(date.month, date.year));
}

using Step = Variant (ORVUtils::*)(const Variant& source, const std::int16_t& count);

constexpr struct {
  TextView word;
  Step step;
} step_words[] = {
    {u"Years", &ORVUtils::IncYear},    {u"Yearly", &ORVUtils::IncYear}, {u"Months", &ORVUtils::IncMonth},
    {u"Monthly", &ORVUtils::IncMonth}, {u"Weeks", &ORVUtils::IncWeek},  {u"Weekly", &ORVUtils::IncWeek},
    {u"Days", &ORVUtils::IncDay},      {u"Daily", &ORVUtils::IncDay},
};

}  // namespace

Variant ORVUtils::IncDay(const Variant& vSrcDate, const std::int16_t& iNum) {
  return step_days(*this, vSrcDate, iNum, std::numeric_limits<std::int32_t>::min());
}

Variant ORVUtils::IncWeek(const Variant& vSrcDate, const std::int16_t& iNum) {
  // Going forward, a month's length is queried only after day 28.
  return step_days(*this, vSrcDate, checked_multiply<std::int16_t>(iNum, 7), 28);
}

Variant ORVUtils::IncMonth(const Variant& vSrcDate, const std::int16_t& iNum) {
  CalendarDay date = calendar_day(vSrcDate, locale());
  const std::int32_t steps = iNum < 0 ? -steps_of(iNum) : iNum;
  // The year 0 is a year like any other here, and months before it continue downwards.
  const std::int32_t months = date.year * 12 + date.month - 1 + steps;
  const std::int32_t month = (months % 12 + 12) % 12;
  date.month = static_cast<std::int16_t>(month + 1);
  date.year = static_cast<std::int16_t>((months - month) / 12);
  shorten_to_month(*this, date);
  return date_text(date, locale());
}

Variant ORVUtils::IncYear(const Variant& vSrcDate, const std::int16_t& iNum) {
  CalendarDay date = calendar_day(vSrcDate, locale());
  date.year = checked_add(date.year, iNum);
  shorten_to_month(*this, date);
  return date_text(date, locale());
}

Variant ORVUtils::GetNextDate(const Variant& vStartDate, const Variant& vStep, const Variant& vIncrement) {
  const std::int16_t count = vIncrement.to_int16(locale());
  const Variant wanted = vStep.value();
  Variant date;
  for (const auto& [word, step] : step_words) {
    if (wanted.equals_text(word, locale())) date = (this->*step)(vStartDate, count);
  }
  // Empty, the result for an unknown word, is formatted as day 0.
  if (const auto* const text = date.get_if<Text>()) return reformatted(*text, date_pattern, locale());
  return format_date(formatted_date(date, locale()), date_pattern);
}

Variant ORVUtils::AddTimeToDate(const Variant& vSrcDate, const Text& sTime) {
  const DateParts day = parts_of(formatted_date(vSrcDate, locale()));
  const DateParts time = parts_of(formatted_date(sTime, locale()));
  const Text text =
      short_date_text(day.day, day.month, day.year) + u" " + hours_and_minutes_text(in_minutes(time.hour, time.minute));
  return reformatted(text, date_and_time_pattern, locale());
}

}  // namespace talutil
