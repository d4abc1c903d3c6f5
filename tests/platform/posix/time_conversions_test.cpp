#include "platform/posix/posix_time_conversions.hpp"

#include <gtest/gtest.h>
#include <stdlib.h>
#include <time.h>

#include "tests/dates/late_members.hpp"

namespace talutil::posix {
namespace {

/// Sets the zone of the process, and puts it back.
class Zone {
 public:
  explicit Zone(const char* name) {
    if (const char* const before = getenv("TZ")) before_ = before;
    setenv("TZ", name, 1);
  }
  Zone(const Zone&) = delete;
  Zone& operator=(const Zone&) = delete;
  ~Zone() {
    if (before_)
      setenv("TZ", before_->c_str(), 1);
    else
      unsetenv("TZ");
    tzset();
  }

 private:
  std::optional<std::string> before_;
};

/// A toolkit on the fake platform but for the zone.
class PosixZones : public ::testing::Test {
 protected:
  talutil::testing::FakePlatform fake;
  PosixTimeConversions conversions;
  Library library{[this] {
    fake.real_time_conversions = &conversions;
    return fake.platform();
  }()};
  ORVUtils utils{library};
};

TEST_F(PosixZones, TodaysOffsetCountsForEveryDate) {
  const struct {
    const char* name;
    std::int32_t standard_minutes;
    std::int32_t summer_minutes;
  } rows[] = {
      {"Australia/Brisbane", 600, 600}, {"Australia/Sydney", 600, 660}, {"Europe/London", 0, 60},
      {"America/St_Johns", -210, -150}, {"Pacific/Chatham", 765, 825},
  };
  for (const auto& row : rows) {
    const Zone zone(row.name);
    tzset();
    const time_t now = time(nullptr);
    struct tm local {};
    localtime_r(&now, &local);
    const std::int32_t minutes = local.tm_isdst > 0 ? row.summer_minutes : row.standard_minutes;
    for (const TextView text : {u"05/01/2009 13:45", u"05/07/2009 13:45", u"31/12/1700 23:59"}) {
      const Date date = Variant(text).to_date(plain_numbers);
      const Date utc = date_add(DateInterval::minute, -minutes, date);
      EXPECT_EQ(date_to_text(utils.LocalTimeToUTC(date)), date_to_text(utc)) << row.name;
      EXPECT_EQ(date_to_text(utils.UTCToLocalTime(utc)), date_to_text(date)) << row.name;
    }
  }
}

}  // namespace
}  // namespace talutil::posix
