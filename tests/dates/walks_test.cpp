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

struct Counts {
  std::int32_t days = 0;
  std::int32_t months = 0;
};

/// Walks from the earlier to the later day, both included.
Counts walk(Date from, Date to) {
  Counts counts;
  std::int32_t previous_month = 0;
  const Date end = to_date_checked(normalised(to).days + 1);
  for (Date d = normalised(from); d.days < end.days; d = to_date_checked(normalised(d).days + 1)) {
    ++counts.days;
    const auto month = static_cast<std::int32_t>(leading_number(format_date(d, u"DD/MM/YYYY").substr(3, 2)));
    if (month != previous_month) ++counts.months;
    previous_month = month;
  }
  return counts;
}

TEST_F(Walks, DaysAndMonthsInAPeriod) {
  for (int i = 0; i < pairs; ++i) {
    const Date a = any_day();
    const double distance = generator.whole(0, 99) == 0 ? generator.whole(-3000, 3000) : generator.whole(-70, 70);
    const Date b{a.days + distance};
    if (!is_in_date_range(b.days)) continue;
    Counts counts;
    const std::int32_t error = error_of([&] {
      if (a == b)
        counts.days = 1;
      else
        counts = a.days < b.days ? walk(a, b) : walk(b, a);
    });
    std::int32_t days = 0;
    std::int32_t months = 0;
    EXPECT_EQ(error_of([&] { days = utils.GetDaysInPeriod(a, b); }), error);
    EXPECT_EQ(error_of([&] { months = utils.GetMonthsInPeriod(a, b); }), error);
    if (error != 0) continue;
    EXPECT_EQ(days, counts.days - 1) << to_utf8(date_to_text(a)) << ' ' << to_utf8(date_to_text(b));
    EXPECT_EQ(months, counts.months - 1) << to_utf8(date_to_text(a)) << ' ' << to_utf8(date_to_text(b));
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
