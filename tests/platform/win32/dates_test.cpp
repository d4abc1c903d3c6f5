#include <gtest/gtest.h>

#include <bit>

#include "automation/date.hpp"
#include "tests/platform/win32/oracle.hpp"

namespace talutil::testing {
namespace {

constexpr int generated_count = 25'000;

/// Any second there is, from the first day asked for on.
double any_days(Generator& generator, std::int32_t first_day = -657434) {
  const double second = generator.whole(0, 86399);
  const std::int32_t day = generator.whole(first_day, 2958465);
  return day < 0 ? day - second / 86400 : day + second / 86400;
}

TEST(PlatformDates, Parts) {
  Generator generator;
  for (int i = 0; i < generated_count; ++i) {
    const double days = any_days(generator);
    UDATE expected{};
    ASSERT_EQ(VarUdateFromDate(days, 0, &expected), S_OK) << days;
    const SYSTEMTIME& time = expected.st;
    const DateParts parts = parts_of({days});
    EXPECT_EQ(parts, (DateParts{time.wYear, time.wMonth, time.wDay, time.wHour, time.wMinute, time.wSecond})) << days;
    double back = 0;
    ASSERT_EQ(VarDateFromUdate(&expected, 0, &back), S_OK) << days;
    // The 64-bit platform adds day and time in other steps, which may round the last bit otherwise.
    ASSERT_TRUE(date_from_parts(parts)) << days;
    EXPECT_DOUBLE_EQ(date_from_parts(parts)->days, back) << days;
  }
}

TEST(PlatformDates, SerialParts) {
  Generator generator;
  for (int i = 0; i < generated_count; ++i) {
    const auto part = [&](std::int32_t first, std::int32_t last) {
      return static_cast<std::int16_t>(generator.whole(first, last));
    };
    // The platform knows a time of day only within the day, and some make 10 January of 40 November.
    const SystemTime time{part(101, 9998), part(-12, 24), 0, part(-60, 30), part(0, 23), part(0, 59), part(0, 59)};
    UDATE parts{std::bit_cast<SYSTEMTIME>(time), 0};
    double expected = 0;
    ASSERT_EQ(VarDateFromUdate(&parts, 0, &expected), S_OK) << i;
    const std::int32_t second = (time.wHour * 60 + time.wMinute) * 60 + time.wSecond;
    EXPECT_EQ(outcome([&] { return date_from_serial(time.wYear, time.wMonth, time.wDay, second); }),
              outcome([&] { return Date{expected}; }))
        << time.wYear << '/' << time.wMonth << '/' << time.wDay;
  }
}

TEST(PlatformDates, Patterns) {
  constexpr TextView patterns[] = {u"DD/MM/YYYY",     u"DD/MM/YYYY HH:MM", u"DD/MM/YY",     u"DDMMYYYY",     u"HH:MM",
                                   u"DDMMYYYYHHMMSS", u"DD_MM_YYYY",       u"d.m.yy h:n:s", u"nn m hh mm mm"};
  constexpr std::int32_t year_1000 = -328716;
  Generator generator;
  for (int i = 0; i < generated_count; ++i) {
    const double days = any_days(generator, year_1000);
    Text pattern(generator.one_of(patterns));
    VARIANT value{};
    V_VT(&value) = VT_DATE;
    V_DATE(&value) = days;
    EXPECT_EQ(outcome([&] { return format_date({days}, pattern); }),
              platform_outcome<BSTR>([&](BSTR* text) { return VarFormat(&value, raw(pattern), 1, 1, 0, text); }))
        << to_utf8(pattern) << ' ' << days;
  }
  // Years before 1000 have four digits with us, and the day can be read off them again.
  EXPECT_EQ(format_date({-657434}, u"DD/MM/YYYY"), u"01/01/0100");
}

std::string platform_date(Text text) {
  return platform_outcome<Date>([&](Date* date) { return VarDateFromStr(raw(text), british_english, 0, &date->days); });
}

std::int32_t year_of_clock() {
  SYSTEMTIME now{};
  GetLocalTime(&now);
  return now.wYear;
}

/// A date and a time in one of the forms that people write, right or wrong.
Text date_like_text(Generator& generator) {
  constexpr TextView days[] = {u"1", u"05", u"12", u"13", u"28"};
  constexpr TextView all_days[] = {u"1", u"05", u"12", u"13", u"28", u"29", u"30", u"31"};
  constexpr TextView months[] = {u"2", u"03", u"12", u"13", u"14", u"Mar", u"FEBRUARY", u"oct", u"Foo"};
  constexpr TextView years[] = {u"00", u"29", u"50", u"99", u"100", u"1999", u"2012", u"9999", u"10000"};
  constexpr TextView first_years[] = {u"50", u"99", u"100", u"1999", u"2012", u"9999", u"10000"};
  constexpr TextView marks[] = {u"/", u"-", u" ", u" / "};
  constexpr TextView times[] = {u"13:45", u"1:45:30 PM", u"0:00",   u"12:30am", u"7 pm",  u"1 : 05", u"24:00",
                                u"1:60",  u"1:1:60",     u"1:00 x", u"13 pm",   u"12 AM", u"1:2:3:4"};
  const TextView month = generator.one_of(months);
  const TextView day = generator.one_of(all_days);
  const TextView year = generator.one_of(years);
  const TextView orders[][3] = {{day, month, year},
                                {month, day, year},
                                {generator.one_of(first_years), month, day},
                                {generator.one_of(days), month, u""}};
  const auto& order = generator.one_of(orders);
  Text date(order[0]);
  for (const TextView part : {order[1], order[2]}) {
    if (!part.empty()) date += Text(generator.one_of(marks)) + Text(part);
  }
  const Text time(generator.one_of(times));
  const Text forms[] = {date, date + u" " + time, time + u"  " + date, time, date + u"/"};
  return generator.one_of(forms);
}

TEST(PlatformDates, TextToDate) {
  Generator generator;
  int accepted = 0;
  for (int i = 0; i < generated_count; ++i) {
    const Text text = date_like_text(generator);
    const std::string ours = outcome([&] { return text_to_date(text, year_of_clock()); });
    if (ours != "none") ++accepted;
    EXPECT_EQ(ours, platform_date(text)) << to_utf8(text);
  }
  EXPECT_GT(accepted, generated_count / 5);
}

TEST(PlatformDates, DeliberateDifferences) {
  const struct {
    const char* reason;
    TextView text;
    const char* ours;
    const char* platforms;
  } rows[] = {
      {"two-digit years end at 2029, not 2049", u"1/2/30", "01/02/1930", "01/02/2030"},
      {"a full stop stands in dates, not in times", u"5.3.2009", "05/03/2009", "none"},
      {"", u"1.30", "none", "01:30"},
      {"Sep is a month as Sept is", u"5 Sep 2009", "05/09/2009", "none"},
      {"a day that its month lacks is no year", u"31 Feb", "none", "01/02/2031"},
      {"", u"30/2", "none", "01/02/2030"},
      {"nor does a small number stand for the year first", u"31/9/12", "none", "12/09/2031"},
      {"", u"0/5/09", "none", "09/05/2000"},
      {"", u"31-sept-29", "none", "29/09/2031"},
      {"nor behind a month", u"Mar 32", "none", "01/03/2032"},
      {"one month is enough", u"Mar 5 Mar", "none", "05/03/2003"},
      {"the month's name is never last of three", u"2009 5 Mar", "none", "05/03/2009"},
      {"no names of weekdays", u"Thu, 5 Mar 2009", "none", "05/03/2009"},
      {"commas only beside a month's name", u"5,3,2009", "none", "05/03/2009"},
      {"", u"5/3/2009, 13:45", "none", "05/03/2009 13:45"},
      {"a mark at the end has no meaning", u"5/3 2009 / ", "none", "05/03/2009"},
      {"blanks alone part date and time", u"5 Mar 2009/13:45", "none", "05/03/2009 13:45"},
      {"half a mark is none", u"1:45a", "none", "01:45"},
      {"13 is no hour of the morning", u"13:45 AM", "none", "13:45"},
      {"one colon at a time", u"1::30", "none", "01:30"},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(outcome([&] { return text_to_date(row.text, year_of_clock()); }), row.ours) << to_utf8(row.text);
    EXPECT_EQ(platform_date(Text(row.text)), row.platforms) << to_utf8(row.text);
  }
}

}  // namespace
}  // namespace talutil::testing
