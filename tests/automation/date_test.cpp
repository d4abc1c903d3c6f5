#include "automation/date.hpp"

#include <gtest/gtest.h>

#include "tests/fakes/error_of.hpp"
#include "tests/fakes/rows.hpp"

namespace talutil {
namespace {

using testing::check_rows;
using testing::outcome;

TEST(Date, PartsBetweenSecondsAndAtTheEnds) {
  EXPECT_EQ(parts_of({-657434.99998842592}), (DateParts{100, 1, 1, 23, 59, 59}));
  EXPECT_EQ(parts_of({2958465.99998842592}), (DateParts{9999, 12, 31, 23, 59, 59}));
  EXPECT_EQ(parts_of({39876.999999}), (DateParts{2009, 3, 5, 0, 0, 0}));
  EXPECT_EQ(parts_of({-1.999999}), (DateParts{1899, 12, 30, 0, 0, 0}));
}

TEST(Date, OutOfRange) {
  EXPECT_EQ(outcome([] { return to_date_checked(-657435); }), "error 6");
  EXPECT_EQ(outcome([] { return to_date_checked(2958465.999999); }), "error 6");
  EXPECT_EQ(outcome([] { return parts_of({1e300}).day; }), "error 6");
  const DateParts no_dates[] = {
      {2009, 2, 29, 0, 0, 0}, {1900, 2, 29, 0, 0, 0}, {2009, 13, 1, 0, 0, 0}, {2009, 0, 1, 0, 0, 0},
      {2009, 1, 0, 0, 0, 0},  {99, 1, 1, 0, 0, 0},    {10000, 1, 1, 0, 0, 0}, {2009, 1, 1, 24, 0, 0},
      {2009, 1, 1, 0, 60, 0}, {2009, 1, 1, 0, 0, 60}, {2009, 1, 1, -1, 0, 0}, {2009, 4, 31, 0, 0, 0},
  };
  for (const DateParts& parts : no_dates) {
    EXPECT_FALSE(date_from_parts(parts)) << parts.year << '-' << parts.month << '-' << parts.day << ' ' << parts.hour;
  }
}

// What docs/dates.md lists is read by tests/cli/run.sh; other texts are compared with the platform's reading.
TEST(Date, TextWithoutAYear) {
  EXPECT_TRUE(text_to_date(u"29/2", 2012));
  EXPECT_FALSE(text_to_date(u"29/2", 2011));
  EXPECT_EQ(outcome([&] { return text_to_date(u"5/13", 2011); }), "13/05/2011");
}

TEST(Date, Intervals) {
  using enum DateInterval;
  const testing::Rows<DateInterval, std::int32_t, TextView, std::string, TextView, std::int32_t> rows = {
      {"seconds across day 0", second, -1, u"30/12/1899", "29/12/1899 23:59:59", u"29/12/1899 23:59:58", -2},
      {"minutes", minute, 90, u"1/1/1800", "01/01/1800 01:30", u"1/1/1800 1:30:59", 90},
      {"hours before day 0", hour, -26, u"2/1/1800 1:30", "31/12/1799 23:30", u"1/1/1800 23:59", -2},
      {"days keep the time", day, 1, u"29/12/1899 18:00", "18:00", u"31/12/1899 0:00", 2},
      {"a month's last day", month, 1, u"31/1/2008 13:45", "29/02/2008 13:45", u"1/3/2007", -10},
      {"years", year, -1, u"29/2/2008", "28/02/2007", u"1/1/1899", -109},
  };
  check_rows(rows, [](auto interval, auto count, TextView start, const auto& added, TextView end, auto boundaries) {
    const Date from = Variant(start).to_date(plain_numbers);
    EXPECT_EQ(outcome([&] { return date_add(interval, count, from); }), added);
    EXPECT_EQ(date_difference(interval, from, Variant(end).to_date(plain_numbers)), boundaries);
  });
  EXPECT_EQ(outcome([] { return date_add(day, 1, Date{2958465}); }), "error 5");
  EXPECT_EQ(outcome([] { return date_add(month, -1, Date{-657434}); }), "error 5");
  EXPECT_EQ(outcome([] { return date_add(year, 2147483647, Date{}); }), "error 5");
  EXPECT_EQ(outcome([] { return date_difference(second, Date{0}, Date{40000}); }), "error 6");
  EXPECT_TRUE(std::is_lt(compare_dates({-1.25}, {-1.75})));
  EXPECT_EQ(day_of_year({36525}), 366 - 1);
}

TEST(Date, Patterns) {
  const Date date = Variant(u"5/3/0109 1:02:09").to_date(plain_numbers);
  EXPECT_EQ(format_date(date, u"d-m-yy yyyy D/M"), u"5-3-09 0109 5/3");
  EXPECT_EQ(format_date(date, u"hh:mm:ss mm, h.n.s (HhMm) nn"), u"01:02:09 03, 1.2.9 (0102) 02");
}

TEST(Date, ToText) {
  EXPECT_EQ(date_to_text({-0.25}), u"06:00");
  EXPECT_EQ(date_to_text({39876.999999}), u"05/03/2009");  // A second after rounding.
  EXPECT_EQ(outcome([] { return date_to_text({3e6}); }), "error 6");
}

}  // namespace
}  // namespace talutil
