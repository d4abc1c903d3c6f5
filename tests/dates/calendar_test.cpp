// What the members say of days and months, compared with the calendar.
#include <chrono>
#include <cmath>

#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {
namespace {

constexpr int pairs = 10'000;
constexpr std::int32_t first_day = -657434;
constexpr std::int32_t last_day = 2958465;

struct Calendar : UtilsTest {
  Generator generator;

  /// Any day there is; one in eight lies near the first or the last.
  Date any_day() {
    const std::int32_t kind = generator.whole(0, 15);
    return {static_cast<double>(
        generator.whole(kind == 1 ? last_day - 800 : first_day, kind == 0 ? first_day + 800 : last_day))};
  }
};

std::string text_of(std::int32_t day, std::int32_t month, std::int32_t year) {
  const Text text = number_to_text(day) + u"/" + number_to_text(month) + u"/" + number_to_text(year);
  const auto date = text_to_date(text, 2009);
  return to_utf8(date ? date_to_text(*date) : text);
}

TEST_F(Calendar, DaysAndMonthsInAPeriod) {
  for (int i = 0; i < pairs; ++i) {
    const Date a = any_day();
    const double distance = generator.whole(0, 99) == 0 ? generator.whole(-3000, 3000) : generator.whole(-70, 70);
    const Date b{a.days + distance};
    if (!is_in_date_range(b.days)) continue;
    SCOPED_TRACE(to_utf8(date_to_text(a) + u" " + date_to_text(b)));
    const auto months_of = [](Date date) { return parts_of(date).year * 12 + parts_of(date).month; };
    // The day behind the last one is looked at too, unless there is but one.
    const bool is_refused = a != b && std::max(a.days, b.days) == last_day;
    const auto expected = [&](double count) {
      return is_refused ? "error 6" : std::to_string(static_cast<std::int32_t>(a == b ? count : std::abs(count)));
    };
    EXPECT_EQ(outcome([&] { return utils.GetDaysInPeriod(a, b); }), expected(b.days - a.days));
    EXPECT_EQ(outcome([&] { return utils.GetMonthsInPeriod(a, b); }),
              expected(a == b ? -1 : months_of(b) - months_of(a)));
  }
}

TEST_F(Calendar, DaysAndMonthsLater) {
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

TEST_F(Calendar, StepsGoByTheObjectsOwnMonths) {
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
