// What the members compute directly, compared with the walks that define it, step for step, and with the calendar.
#include <chrono>

#include "automation/checked.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {
namespace {

constexpr int pairs = 10'000;

struct Walks : UtilsTest {
  Generator generator;

  /// Any day there is; one in eight lies near the first or the last.
  Date any_day() {
    constexpr std::int32_t first = -657434;
    constexpr std::int32_t last = 2958465;
    const std::int32_t kind = generator.whole(0, 15);
    return {static_cast<double>(generator.whole(kind == 1 ? last - 800 : first, kind == 0 ? first + 800 : last))};
  }
};

std::string text_of(std::int32_t day, std::int32_t month, std::int32_t year) {
  const Text text = number_to_text(day) + u"/" + number_to_text(month) + u"/" + number_to_text(year);
  const auto date = text_to_date(text, 2009);
  return to_utf8(date ? date_to_text(*date) : text);
}

Date normalised(Date date) { return Variant(format_date(date, u"DD/MM/YYYY")).to_date(plain_numbers); }

/// The days and the months of a walk from one day to a later one, both included, less one each.
std::pair<std::int32_t, std::int32_t> walk(Date from, Date to) {
  std::int32_t days = -1;
  std::int32_t months = -1;
  Text previous_month;
  const Date end = to_date_checked(normalised(to).days + 1);
  for (Date d = normalised(from); d.days < end.days; d = to_date_checked(normalised(d).days + 1)) {
    ++days;
    Text month = format_date(d, u"MM");
    if (month != previous_month) ++months;
    previous_month = std::move(month);
  }
  return {days, months};
}

TEST_F(Walks, DaysAndMonthsInAPeriod) {
  for (int i = 0; i < pairs; ++i) {
    const Date a = any_day();
    const double distance = generator.whole(0, 99) == 0 ? generator.whole(-3000, 3000) : generator.whole(-70, 70);
    const Date b{a.days + distance};
    if (!is_in_date_range(b.days)) continue;
    SCOPED_TRACE(to_utf8(date_to_text(a) + u" " + date_to_text(b)));
    std::pair walked(0, -1);  // The same day takes no walk.
    const std::int32_t error = error_of([&] {
      if (a != b) walked = a.days < b.days ? walk(a, b) : walk(b, a);
    });
    const auto expected = [&](std::int32_t count) { return error == 0 ? std::to_string(count) : "error 6"; };
    EXPECT_EQ(outcome([&] { return utils.GetDaysInPeriod(a, b); }), expected(walked.first));
    EXPECT_EQ(outcome([&] { return utils.GetMonthsInPeriod(a, b); }), expected(walked.second));
  }
}

TEST_F(Walks, DaysAndMonthsLater) {
  using namespace std::chrono;
  for (int i = 0; i < pairs; ++i) {
    const Date start = any_day();
    const std::int32_t most = generator.whole(0, 99) == 0 ? 32767 : 1200;
    const auto count = static_cast<std::int16_t>(generator.whole(-most, most));
    const sys_days first = sys_days(1899y / December / 30) + days(static_cast<int>(start.days));
    const year_month_day date(first);
    const auto check = [&](const Variant& later, const year_month_day& expected) {
      EXPECT_EQ(to_utf8(later.to_text(plain_numbers)),
                text_of(int(unsigned(expected.day())), int(unsigned(expected.month())), int(expected.year())))
          << to_utf8(date_to_text(start)) << ' ' << count;
    };
    check(utils.IncDay(start, count), first + days(count));
    const year_month month = date.year() / date.month() + months(count);
    check(utils.IncMonth(start, count), month / std::min(date.day(), (month / last).day()));
  }
}

/// A calendar in which every month has twenty days.
class ShortMonths final : public ORVUtils {
 public:
  using ORVUtils::ORVUtils;
  std::int16_t GetDaysThisMonth(const std::int16_t& /*iMonth*/, const std::int16_t& /*iYear*/) override { return 20; }
};

TEST_F(Walks, StepsGoByTheObjectsOwnMonths) {
  ShortMonths object(library);
  EXPECT_EQ(object.IncDay(u"19/01/2009", 2), Variant(u"01/02/2009"));
  EXPECT_EQ(object.IncDay(u"25/01/2009", 21), Variant(u"01/03/2009"));
  EXPECT_EQ(object.IncDay(u"01/03/2009", -21), Variant(u"20/01/2009"));
  EXPECT_EQ(object.IncMonth(u"31/01/2009", 1), Variant(u"20/02/2009"));
  // The week goes on to day 28 without asking.
  EXPECT_EQ(object.IncWeek(u"19/01/2009", 1), Variant(u"26/01/2009"));
  EXPECT_EQ(object.IncWeek(u"26/01/2009", 1), Variant(u"05/02/2009"));
}

}  // namespace
}  // namespace talutil::testing
