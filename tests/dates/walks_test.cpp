// What the members compute directly, compared with the walks that define it, step for step.
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
  for (int i = 0; i < pairs; ++i) {
    const Date start = any_day();
    const std::int32_t most = generator.whole(0, 99) == 0 ? 32767 : 1200;
    const auto count = static_cast<std::int16_t>(generator.whole(-most, most));
    const DateParts parts = parts_of(start);
    const auto length = [this](std::int32_t month, std::int32_t year) {
      return utils.GetDaysThisMonth(static_cast<std::int16_t>(month), static_cast<std::int16_t>(year));
    };
    std::int32_t day = parts.day;
    std::int32_t month = parts.month;
    std::int32_t year = parts.year;
    const auto month_on = [&] { month < 12 ? ++month : (++year, month = 1); };
    const auto month_back = [&] { month > 1 ? --month : (--year, month = 12); };
    for (std::int32_t n = 0; n < count; ++n) {
      if (++day > length(month, year)) day = 1, month_on();
    }
    for (std::int32_t n = 0; n > count; --n) {
      if (--day < 1) month_back(), day = length(month, year);
    }
    EXPECT_EQ(to_utf8(utils.IncDay(start, count).to_text(plain_numbers)), text_of(day, month, year))
        << to_utf8(date_to_text(start)) << ' ' << count;

    day = parts.day, month = parts.month, year = parts.year;
    for (std::int32_t n = 0; n < count; ++n) month_on();
    for (std::int32_t n = 0; n > count; --n) month_back();
    day = std::min<std::int32_t>(day, length(month, year));
    EXPECT_EQ(to_utf8(utils.IncMonth(start, count).to_text(plain_numbers)), text_of(day, month, year))
        << to_utf8(date_to_text(start)) << ' ' << count;
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
