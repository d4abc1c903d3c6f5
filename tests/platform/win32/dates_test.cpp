#include <gtest/gtest.h>

#include "automation/date.hpp"
#include "tests/platform/win32/oracle.hpp"

namespace talutil::testing {
namespace {

constexpr int generated_count = 25'000;

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

}  // namespace
}  // namespace talutil::testing
