#include "automation/control.hpp"

#include <gtest/gtest.h>

#include "tests/automation/outcome.hpp"

namespace talutil {
namespace {

/// An object with one value, which is its default member (0) and its member "Item" (7).
class Holder : public Object {
 public:
  explicit Holder(Variant value) : value_(std::move(value)) {}

  std::int32_t member_id(TextView name) override {
    if (!equals_without_case(name, u"Item")) raise(ErrorNumber::member_not_supported);
    return 7;
  }

  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override {
    if (member != default_member && member != 7) raise(ErrorNumber::member_not_supported);
    last_member = member;
    last_access = access;
    last_arguments.assign(arguments.begin(), arguments.end());
    if (access == Access::put) value_ = arguments.back();
    return value_;
  }

  std::int32_t last_member = -1;
  Access last_access = Access::call;
  std::vector<Variant> last_arguments;

 private:
  Variant value_;
};

Variant nested(Variant value, int depth) {
  for (int i = 0; i < depth; ++i) value = ObjectRef(std::make_shared<Holder>(std::move(value)));
  return value;
}

TEST(Variant, Conversions) {
  const struct {
    const char* name;
    Variant value;
    const char* text;
    const char* number;
    const char* int16;
    const char* currency;
    const char* boolean;
    const char* date;
  } rows[] = {
      {"Null", Null{}, "error 94", "error 94", "error 94", "error 94", "error 94", "error 94"},
      {"odd bits of a Boolean", Boolean::from_bits(5), "True", "5", "5", "5", "True", "04/01/1900"},
      {"double", 2.5, "2.5", "2.5", "2", "2.5", "True", "01/01/1900 12:00"},
      {"date", Date{39877.5}, "05/03/2009 12:00", "39877.5", "error 6", "39877.5", "True", "05/03/2009 12:00"},
      {"number text", u" 1.5 ", " 1.5 ", "1.5", "2", "1.5", "True", "error 13"},
      {"date text", u"5/3/09", "5/3/09", "error 13", "error 13", "error 13", "error 13", "05/03/2009"},
      {"texts", TextArray{}, "error 13", "error 13", "error 13", "error 13", "error 13", "error 13"},
      {"other array", ForeignArray{}, "error 13", "error 13", "error 13", "error 13", "error 13", "error 13"},
      {"object", nested(7, 1), "7", "7", "7", "7", "True", "06/01/1900"},
      {"object of a text", nested(u"&HFFFF", 2), "&HFFFF", "65535", "-1", "65535", "True", "error 13"},
      {"deepest object", nested(7, 16), "7", "7", "7", "7", "True", "06/01/1900"},
      {"deeper", nested(7, 17), "error 438", "error 438", "error 438", "error 438", "error 438", "error 438"},
      {"no object", ObjectRef(), "error 91", "error 91", "error 91", "error 91", "error 91", "error 91"},
  };
  for (const auto& row : rows) {
    const Variant& value = row.value;
    EXPECT_EQ(outcome([&] { return value.to_text(plain_numbers); }), row.text) << row.name;
    EXPECT_EQ(outcome([&] { return value.to_double(plain_numbers); }), row.number) << row.name;
    EXPECT_EQ(outcome([&] { return value.to_int16(plain_numbers); }), row.int16) << row.name;
    EXPECT_EQ(outcome([&] { return value.to_currency(plain_numbers); }), row.currency) << row.name;
    EXPECT_EQ(outcome([&] { return value.to_boolean(plain_numbers); }), row.boolean) << row.name;
    EXPECT_EQ(outcome([&] { return value.to_date(plain_numbers); }), row.date) << row.name;
  }
}

TEST(Variant, NarrowConversions) {
  EXPECT_EQ(Variant(u"&HFFFF").to_int32(plain_numbers), 65535);
  EXPECT_EQ(Variant(Boolean::from_bits(5)).to_boolean(plain_numbers).bits(), 5);
  const Locale locale{.decimal_separator = u',', .thousands_separator = u'.', .current_year = 2012};
  EXPECT_EQ(Variant(1.5).to_text(locale), u"1,5");
  EXPECT_EQ(Variant(u"1.234,5").to_double(locale), 1234.5);
  EXPECT_EQ(Variant(u"29/2").to_date(locale).days, 40968);
}

TEST(Variant, Questions) {
  const struct {
    const char* name;
    Variant value;
    bool is_date;
    bool is_null;
    const char* equals_7;
  } rows[] = {
      {"empty", {}, false, false, "False"},
      {"Null", Null{}, false, true, "False"},
      {"number", 7, false, false, "True"},
      {"text", u"7", false, false, "True"},
      {"longer text", u"7 ", false, false, "False"},
      {"date", Date{7}, true, false, "False"},
      {"date text", u"1:30", true, false, "False"},
      {"object", nested(u"7", 1), false, false, "True"},
      {"object of Null", nested(Null{}, 1), false, true, "False"},
      {"array", TextArray{}, false, false, "error 13"},
      {"error", missing_argument, false, false, "error 13"},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(row.value.is_date(plain_numbers), row.is_date) << row.name;
    EXPECT_EQ(row.value.is_null(), row.is_null) << row.name;
    EXPECT_EQ(outcome([&] { return Boolean(row.value.equals_text(u"7", plain_numbers)); }), row.equals_7) << row.name;
  }
  EXPECT_TRUE(Variant().equals_text(u"", plain_numbers));
  EXPECT_FALSE(Variant(Null{}).equals_text(u"", plain_numbers));
  EXPECT_EQ(outcome([] { return Boolean(Variant(ObjectRef()).is_null()); }), "error 91");
}

TEST(Variant, TextArrayBounds) {
  const TextArray array{{u"a", u"b"}, -1, true};
  EXPECT_EQ(array.upper_bound(), 0);
  EXPECT_EQ(array.at(-1), u"a");
  for (const std::int32_t index : {-2, 1}) EXPECT_EQ(outcome([&] { return array.at(index); }), "error 9") << index;
  EXPECT_EQ((TextArray{{}, 3, true}).upper_bound(), 2);
  EXPECT_EQ(outcome([] { return TextArray{}.upper_bound(); }), "error 9");
  EXPECT_EQ(outcome([] { return TextArray{}.at(0); }), "error 9");
}

TEST(Control, UsesMembersByNameAndIdentifier) {
  const auto holder = std::make_shared<Holder>(u"2.5");
  const Control control(Variant(ObjectRef(holder)), plain_numbers);
  EXPECT_EQ(control.get<std::int32_t>(u"item"), 2);
  EXPECT_EQ(holder->last_member, 7);
  EXPECT_EQ(holder->last_access, Access::get);
  EXPECT_EQ(control.get<std::int16_t>(u"Item"), 2);
  EXPECT_EQ(control.get<double>(default_member), 2.5);
  EXPECT_EQ(control.get<Text>(u"Item", {1, u"x"}), u"2.5");
  EXPECT_EQ(holder->last_arguments, (std::vector<Variant>{1, u"x"}));

  control.put(u"Item", {1}, 9);
  EXPECT_EQ(holder->last_access, Access::put);
  EXPECT_EQ(holder->last_arguments, (std::vector<Variant>{1, 9}));
  control.put(default_member, 8);
  EXPECT_EQ(control.get(u"Item"), Variant(8));
  EXPECT_EQ(control.call(u"Item", {3}), Variant(8));
  EXPECT_EQ(holder->last_access, Access::call);

  EXPECT_EQ(outcome([&] { return control.get(u"Other"); }), "error 438");
  EXPECT_EQ(outcome([] { return Control(Variant(5), plain_numbers).get(0); }), "error 424");
  EXPECT_EQ(outcome([] { return Control(Variant(ObjectRef()), plain_numbers).get(0); }), "error 91");
}

}  // namespace
}  // namespace talutil
