// Conversions of times as both platforms have them, by a counter of days.
#include "tests/fakes/utils_test.hpp"
#include "tests/platform/real_platform.hpp"

namespace talutil::testing {
namespace {

constexpr std::int64_t file_time_day = 86400 * file_time_second;

bool is_leap(int year) { return year % 4 == 0 && (year % 100 != 0 || year % 400 == 0); }
int length_of(int month, int year) {
  return month == 2 ? is_leap(year) ? 29 : 28 : month == 4 || month == 6 || month == 9 || month == 11 ? 30 : 31;
}

struct TimeConversionsTest : UtilsTest {
  TimeConversionsTest()
      : UtilsTest([](auto& fake) { fake.use(&FakePlatform::used_time_conversions, real_time_conversions()); }) {}
  TimeConversions* conversions = platform.used_time_conversions;
  Generator generator;
};

TEST_F(TimeConversionsTest, EveryDayIsCounted) {
  SystemTime time{1601, 1, 1, 1};
  for (std::int64_t day = 0; time.wYear < 2201; ++day) {
    time.wHour = static_cast<std::int16_t>(generator.whole(0, 23));
    time.wMinute = static_cast<std::int16_t>(generator.whole(0, 59));
    time.wSecond = static_cast<std::int16_t>(generator.whole(0, 59));
    const std::int64_t seconds = (time.wHour * 60 + time.wMinute) * 60 + time.wSecond;
    FileTime file = 77;
    SystemTime back;
    conversions->system_to_file(time, file);
    ASSERT_EQ(file, day * file_time_day + seconds * file_time_second);
    conversions->file_to_system(file, back);
    ASSERT_EQ(back, time) << day;
    time.wDayOfWeek = static_cast<std::int16_t>((time.wDayOfWeek + 1) % 7);
    if (++time.wDay > length_of(time.wMonth, time.wYear)) time.wDay = 1, ++time.wMonth;
    if (time.wMonth > 12) time.wMonth = 1, ++time.wYear;
  }
}

TEST_F(TimeConversionsTest, WhatIsNoTimeIsLeftAlone) {
  const auto part = [&](int first, int last) { return static_cast<std::int16_t>(generator.whole(first, last)); };
  for (int i = 0; i < 10'000; ++i) {
    // Some platforms take 29 February of any year for a day.
    const SystemTime time{part(1590, 1612), part(0, 13),  part(0, 9),  i % 10 == 0 ? std::int16_t{32} : part(0, 28),
                          part(-1, 24),     part(-1, 60), part(-1, 60)};
    const bool is_time = time.wYear >= 1601 && time.wMonth >= 1 && time.wMonth <= 12 && time.wDay >= 1 &&
                         time.wDay <= 28 && time.wHour >= 0 && time.wHour < 24 && time.wMinute >= 0 &&
                         time.wMinute < 60 && time.wSecond >= 0 && time.wSecond < 60;
    FileTime file = 77;
    conversions->system_to_file(time, file);
    EXPECT_EQ(file != 77, is_time) << time.wYear << '/' << time.wMonth << '/' << time.wDay << ' ' << time.wHour;
  }
  SystemTime untouched{.wYear = 77};
  conversions->file_to_system(-1, untouched);
  EXPECT_EQ(untouched, SystemTime{.wYear = 77});
}

TEST_F(TimeConversionsTest, TodaysOffsetCountsForEveryDate) {
  for_each_zone([&](std::int64_t offset) {
    for (int i = 0; i < 200; ++i) {
      const FileTime point = FileTime{generator.whole(-1'000'000, 1'000'000'000)} * generator.whole(1, 1'000'000'000);
      FileTime utc = 77;
      FileTime local = 77;
      conversions->local_to_utc(point, utc);
      conversions->utc_to_local(point, local);
      EXPECT_EQ(utc, point - offset * file_time_second);
      EXPECT_EQ(local, point + offset * file_time_second);
    }
    for (const TextView text : {u"05/01/2009 13:45", u"05/07/2009 13:45", u"31/12/1700 23:59"}) {
      const Date date = Variant(text).to_date(plain_numbers);
      const Date utc = date_add(DateInterval::second, static_cast<std::int32_t>(-offset), date);
      EXPECT_EQ(date_to_text(utils.LocalTimeToUTC(date)), date_to_text(utc)) << offset;
      EXPECT_EQ(date_to_text(utils.UTCToLocalTime(utc)), date_to_text(date)) << offset;
    }
  });
}

}  // namespace
}  // namespace talutil::testing
