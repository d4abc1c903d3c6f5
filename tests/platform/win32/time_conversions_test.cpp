#include "platform/win32/win32_time_conversions.hpp"

#include <gtest/gtest.h>

#include <array>
#include <bit>

#include "tests/platform/win32/oracle.hpp"

namespace talutil::win32 {
namespace {

/// The calendar that other platforms convert with, under the offset of this machine.
class Calendar final : public CalendarTimeConversions {
 protected:
  std::int64_t utc_offset_seconds() override {
    TIME_ZONE_INFORMATION zone{};
    const DWORD season = GetTimeZoneInformation(&zone);
    LONG bias = zone.Bias;
    if (season == TIME_ZONE_ID_STANDARD) bias += zone.StandardBias;
    if (season == TIME_ZONE_ID_DAYLIGHT) bias += zone.DaylightBias;
    return std::int64_t{-60} * bias;
  }
};

std::string shown(FileTime time) { return std::to_string(time); }
std::string shown(const SystemTime& time) {
  std::string text;
  for (const int part : std::bit_cast<std::array<std::int16_t, 8>>(time)) text += std::to_string(part) + ' ';
  return text;
}

/// A step of the conversion by both, from an output that shows whether it was left alone.
template <class From, class To>
void compare(void (TimeConversions::*step)(From, To&), std::remove_cvref_t<From> from, To before) {
  Win32TimeConversions platform;
  Calendar calendar;
  To expected = before;
  To got = before;
  (platform.*step)(from, expected);
  (calendar.*step)(from, got);
  EXPECT_EQ(shown(got), shown(expected)) << shown(from);
}

TEST(PlatformTimes, Conversions) {
  Generator generator;
  const auto part = [&](std::int32_t first, std::int32_t last) {
    return static_cast<std::int16_t>(generator.whole(first, last));
  };
  for (int i = 0; i < generated_count && !::testing::Test::HasFailure(); ++i) {
    // Some platforms take 29 February of any year for a day.
    const SystemTime time{
        part(1590, 2200), part(0, 13), part(0, 9), generator.whole(0, 9) == 0 ? std::int16_t{32} : part(0, 28),
        part(-1, 24),     part(0, 60), part(0, 60)};
    compare(&TimeConversions::system_to_file, time, FileTime{77});
    const FileTime point = FileTime{generator.whole(-1'000'000, 1'000'000'000)} * generator.whole(1, 1'000'000'000);
    compare(&TimeConversions::file_to_system, point, SystemTime{.wYear = 77});
    compare(&TimeConversions::local_to_utc, point, FileTime{77});
    compare(&TimeConversions::utc_to_local, point, FileTime{77});
  }
}

}  // namespace
}  // namespace talutil::win32
