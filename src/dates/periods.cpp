#include <algorithm>
#include <cstdlib>

#include "dates/date_arguments.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

/// The number of interval boundaries between the days of two dates, in either order; `when_equal` for the same day and
/// -1 for an empty date. Raises 6 for 31 December 9999 and a different day, because the count is defined as a walk to
/// the day after the later date.
std::int32_t distance(DateInterval interval, const Variant& start, const Variant& end, std::int32_t when_equal,
                      const Locale& locale) {
  const Variant start_value = start.value();
  const Variant end_value = end.value();
  const bool start_is_missing = start_value.equals_text(u"", locale);
  if (end_value.equals_text(u"", locale) || start_is_missing) return -1;
  const Date first = day_of(formatted_date(start_value, locale));
  const Date last = day_of(formatted_date(end_value, locale));
  if (first == last) return when_equal;
  (void)to_date_checked(std::max(first.days, last.days) + 1);
  return std::abs(date_difference(interval, first, last));
}

}  // namespace

std::int32_t ORVUtils::GetDaysInPeriod(const Variant& vStartDate, const Variant& vEndDate) {
  return distance(DateInterval::day, vStartDate, vEndDate, 0, locale());
}

std::int32_t ORVUtils::GetMonthsInPeriod(const Variant& vStartDate, const Variant& vEndDate) {
  // The walk does not start for equal dates, so not even their own month is counted.
  return distance(DateInterval::month, vStartDate, vEndDate, -1, locale());
}

Variant ORVUtils::GetTimeDifference(Variant& vStDate, Variant& vEnDate, Variant& vStTime, Variant& vEnTime) {
  const auto rewrite = [this](Variant& argument, TextView pattern) {
    const Date date = formatted_date(argument, locale());
    argument = format_date(date, pattern);
    return date;
  };
  const auto rewrite_time = [&](Variant& argument) {
    const DateParts time = parts_of(rewrite(argument, time_pattern));
    return in_minutes(time.hour, time.minute);
  };
  const Date start = rewrite(vStDate, date_pattern);
  const Date end = rewrite(vEnDate, date_pattern);
  std::int32_t hours = 0;
  // Compared as texts, day first: 01/02/2024 does not sort after 31/01/2024.
  if (*vEnDate.get_if<Text>() > *vStDate.get_if<Text>()) {
    hours = date_difference(DateInterval::hour, day_of(start), day_of(end));
  }
  const std::int32_t start_minutes = rewrite_time(vStTime);
  const std::int32_t end_minutes = rewrite_time(vEnTime);
  return hours_and_minutes_text(in_minutes(hours, end_minutes - start_minutes));
}

}  // namespace talutil
