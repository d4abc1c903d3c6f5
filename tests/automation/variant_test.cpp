#include "automation/control.hpp"

#include <gtest/gtest.h>

#include <cmath>

#include "tests/fakes/error_of.hpp"
#include "tests/fakes/recording_control.hpp"
#include "tests/fakes/rows.hpp"

namespace talutil {
namespace {

using testing::check_rows;
using testing::outcome;

/// An object of an object ... whose default member has the value.
Variant nested(Variant value, int depth) {
  for (int i = 0; i < depth; ++i) {
    const auto object = std::make_shared<testing::RecordingControl>();
    object->values["#0"] = std::move(value);
    value = ObjectRef(object);
  }
  return value;
}

TEST(Variant, Conversions) {
  using Outcome = std::string;
  // As text, double, 16 bits, currency, Boolean and date.
  const testing::Rows<Variant, Outcome, Outcome, Outcome, Outcome, Outcome, Outcome> rows = {
      {"odd bits of a Boolean", Boolean::from_bits(5), "True", "5", "5", "5", "True", "04/01/1900"},
      {"date", Date{39877.5}, "05/03/2009 12:00", "39877.5", "error 6", "39877.5", "True", "05/03/2009 12:00"},
      {"date text", u"5/3/09", "5/3/09", "error 13", "error 13", "error 13", "error 13", "05/03/2009"},
      {"object", nested(7, 1), "7", "7", "7", "7", "True", "06/01/1900"},
      {"object of a text", nested(u"&HFFFF", 2), "&HFFFF", "65535", "-1", "65535", "True", "error 13"},
      {"deepest object", nested(7, 16), "7", "7", "7", "7", "True", "06/01/1900"},
  };
  const auto check = [](const Variant& value, const Outcome& text, const Outcome& number, const Outcome& int16,
                        const Outcome& currency, const Outcome& boolean, const Outcome& date) {
    EXPECT_EQ(outcome([&] { return value.to_text(plain_numbers); }), text);
    EXPECT_EQ(outcome([&] { return value.to_double(plain_numbers); }), number);
    EXPECT_EQ(outcome([&] { return value.to_int16(plain_numbers); }), int16);
    EXPECT_EQ(outcome([&] { return value.to_currency(plain_numbers); }), currency);
    EXPECT_EQ(outcome([&] { return value.to_boolean(plain_numbers); }), boolean);
    EXPECT_EQ(outcome([&] { return value.to_date(plain_numbers); }), date);
  };
  check_rows(rows, check);
  const testing::Rows<Variant, Outcome> refused = {{"Null", Null{}, "error 94"},
                                                   {"texts", TextArray{}, "error 13"},
                                                   {"other array", ForeignArray{}, "error 13"},
                                                   {"deeper than objects go", nested(7, 17), "error 438"},
                                                   {"no object", ObjectRef(), "error 91"}};
  check_rows(refused, [&](const Variant& value, const Outcome& error) {
    check(value, error, error, error, error, error, error);
  });
}

TEST(Variant, ConversionsOfNumbersAreOdd) {
  testing::Generator generator;
  for (int i = 0; i < 10'000; ++i) {
    const double number = std::ldexp(generator.whole(1, 1 << 30), generator.whole(-60, 150) * generator.whole(0, 2));
    const auto compare = [&](auto convert) {
      const std::string positive = outcome([&] { return convert(Variant(number)); });
      const std::string negative = positive == "0" || positive.starts_with("error") ? positive : "-" + positive;
      EXPECT_EQ(outcome([&] { return convert(Variant(-number)); }), negative) << number;
    };
    compare([](const Variant& value) { return value.to_single(plain_numbers); });
    compare([](const Variant& value) { return value.to_int16(plain_numbers); });
    compare([](const Variant& value) { return value.to_int32(plain_numbers); });
    compare([](const Variant& value) { return value.to_currency(plain_numbers); });
  }
}

TEST(Variant, ConversionsByALocale) {
  const Locale locale{.decimal_separator = u',', .thousands_separator = u'.', .current_year = 2012};
  EXPECT_EQ(Variant(1.5).to_text(locale), u"1,5");
  EXPECT_EQ(Variant(u"1.234,5").to_double(locale), 1234.5);
  EXPECT_EQ(Variant(u"29/2").to_date(locale).days, 40968);
}

TEST(Variant, Questions) {
  const testing::Rows<Variant, bool, bool, std::string> rows = {
      {"empty", {}, false, false, "False"},
      {"Null", Null{}, false, true, "False"},
      {"text", u"7", false, false, "True"},
      {"longer text", u"7 ", false, false, "False"},
      {"date", Date{7}, true, false, "False"},
      {"date text", u"1:30", true, false, "False"},
      {"object", nested(u"7", 1), false, false, "True"},
      {"object of Null", nested(Null{}, 1), false, true, "False"},
      {"error", missing_argument, false, false, "error 13"},
  };
  check_rows(rows, [](const Variant& value, bool is_date, bool is_null, const std::string& equals_7) {
    EXPECT_EQ(value.is_date(plain_numbers), is_date);
    EXPECT_EQ(value.is_null(), is_null);
    EXPECT_EQ(outcome([&] { return Boolean(value.equals_text(u"7", plain_numbers)); }), equals_7);
  });
  EXPECT_TRUE(Variant().equals_text(u"", plain_numbers));
  EXPECT_FALSE(Variant(Null{}).equals_text(u"", plain_numbers));
  EXPECT_EQ(outcome([] { return Boolean(Variant(ObjectRef()).is_null()); }), "error 91");
}

TEST(Control, UsesTheDefaultMember) {
  const auto object = std::make_shared<testing::RecordingControl>();
  object->values = {{"#0", u"2.5"}};
  const Control control(Variant(ObjectRef(object)), plain_numbers);
  EXPECT_EQ(control.get<double>(default_member), 2.5);
  control.put(default_member, 8);
  EXPECT_EQ(control.get(default_member), Variant(8));
  EXPECT_EQ(outcome([] { return Control(Variant(5), plain_numbers).get(0); }), "error 424");
  EXPECT_EQ(outcome([] { return Control(Variant(ObjectRef()), plain_numbers).get(0); }), "error 91");
}

}  // namespace
}  // namespace talutil
