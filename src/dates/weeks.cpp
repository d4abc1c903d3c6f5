#include <algorithm>

#include "automation/checked.hpp"
#include "dates/date_arguments.hpp"
#include "dates/week_tables.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"

namespace talutil {

namespace {

constexpr std::int32_t days_in_week = 7;

/// "DD/MM/" for a day of the year, in a common or a leap year.
Text day_and_month(std::int32_t day_of_year, bool is_leap_calendar) {
  const std::int32_t year = is_leap_calendar ? 2000 : 2001;
  return format_date(date_from_serial(year, 1, day_of_year, 0), u"DD/MM/");
}

/// The layout of the tables depends on the current year, not on the year they are for: the calendar object that hosts
/// used to supply did not know the latter.
bool is_leap_calendar(Library& library) { return is_leap_year(parts_of(library.platform().clock.now()).year); }

}  // namespace

void WeekTables::fill_starts(std::int16_t year, bool is_leap_calendar) {
  const Text year_text = number_to_text(std::int32_t{year});
  starts_ = {};
  for (std::int32_t week = 0; week < last_week; ++week) {
    starts_[static_cast<std::size_t>(week)] = day_and_month(week * days_in_week + 1, is_leap_calendar) + year_text;
  }
}

void WeekTables::fill_ends(std::int16_t year, bool is_leap_calendar) {
  const Text year_text = number_to_text(std::int32_t{year});
  ends_ = {};
  for (std::int32_t week = 1; week < last_week; ++week) {
    ends_[static_cast<std::size_t>(week - 1)] = day_and_month(week * days_in_week, is_leap_calendar) + year_text;
  }
  // The last week takes the rest of the year: eight or nine days.
  ends_[last_week - 1] = u"31/12/" + year_text;
}

std::int16_t ORVUtils::GetWeekNumber(const Variant& vDate) {
  const Variant value = vDate.value();
  if (is_missing_date(value, locale())) return 1;
  const std::int32_t days = day_of_year(formatted_date(value, locale()));
  // The days after week 52 belong to it.
  return static_cast<std::int16_t>(std::min((days + days_in_week - 1) / days_in_week, WeekTables::last_week));
}

Variant ORVUtils::WeekYearToDate(std::int16_t& iWeek, const std::int16_t& iYear, const std::int16_t& iDay) {
  iWeek = std::clamp<std::int16_t>(iWeek, 1, WeekTables::last_week);
  WeekTables& tables = library().part<WeekTables>();
  const bool is_leap = is_leap_calendar(library());
  tables.fill_starts(iYear, is_leap);
  tables.fill_ends(iYear, is_leap);
  if (iDay == 0) {
    // The start of the following week, unlike mode 1.
    const Date new_year = Variant(u"1/1/" + number_to_text(std::int32_t{iYear})).to_date(locale());
    return IncDay(new_year, static_cast<std::int16_t>(iWeek * days_in_week));
  }
  if (iDay == 1) return Variant(tables.start(iWeek)).to_date(locale());
  if (iDay == 2) return Variant(tables.end(iWeek)).to_date(locale());
  return {};
}

Boolean ORVUtils::GetWeekInDateRange(const Variant& vFromDate, const Variant& vToDate, std::int16_t& iWeek,
                                     const std::int16_t& iYear) {
  const Date week = WeekYearToDate(iWeek, iYear, 0).to_date(locale());
  const Date from = vFromDate.to_date(locale());
  const Date to = vToDate.to_date(locale());
  // Combined with "or": False only if the range runs backwards around the date.
  return Boolean(std::is_lteq(compare_dates(from, week)) || std::is_gteq(compare_dates(to, week)));
}

}  // namespace talutil
