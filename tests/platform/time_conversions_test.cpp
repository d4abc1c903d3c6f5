// Conversions of times as both platforms have them, by a calendar of the standard library.
#include <chrono>

#include "tests/fakes/utils_test.hpp"
#include "tests/platform/real_platform.hpp"

namespace talutil::testing {
namespace {

using namespace std::chrono;

struct TimeConversionsTest : UtilsTest {
  TimeConversionsTest() : UtilsTest([](auto& fake) { fake.used_times = &real_platform().time_conversions; }) {}
  TimeConversions* conversions = platform.used_times;
  Generator generator;
  std::int16_t part(int first, int last) { return static_cast<std::int16_t>(generator.whole(first, last)); }
};

TEST_F(TimeConversionsTest, EveryDayIsCounted) {
  constexpr sys_days first = 1601y / 1 / 1;
  for (sys_days day = first; day < sys_days(2201y / 1 / 1); day += days(1)) {
    const year_month_day date(day);
    const SystemTime time{static_cast<std::int16_t>(int(date.year())),
                          static_cast<std::int16_t>(unsigned(date.month())),
                          static_cast<std::int16_t>(weekday(day).c_encoding()),
                          static_cast<std::int16_t>(unsigned(date.day())),
                          part(0, 23),
                          part(0, 59),
                          part(0, 59)};
    const seconds since = day - first + hours(time.wHour) + minutes(time.wMinute) + seconds(time.wSecond);
    FileTime file = 77;
    SystemTime back;
    conversions->system_to_file(time, file);
    ASSERT_EQ(file, since.count() * file_time_second);
    conversions->file_to_system(file, back);
    ASSERT_EQ(back, time) << file;
  }
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
