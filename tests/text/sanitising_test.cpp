#include <limits>

#include "tests/fakes/late_members.hpp"
#include "tests/fakes/recording_control.hpp"

namespace talutil::testing {
namespace {

struct Sanitising : LateMembers {
  /// The same from an object without overridden members, which does all work at once.
  Text verified(std::int16_t width, std::int16_t extras, const Variant& data) {
    const Text result = utils.VerifyTextData(width, extras, data);
    EXPECT_EQ(plain.VerifyTextData(width, extras, data), result);
    return result;
  }

  ORVUtils plain{library};
};

constexpr std::int32_t counter_maximum = std::numeric_limits<std::int32_t>::max();

/// An object whose default member has a value, or that has none.
Variant holder_of(std::optional<Variant> value) {
  const auto object = std::make_shared<RecordingControl>();
  if (value) object->values["#" + std::to_string(default_member)] = *value;
  return ObjectRef(object);
}

// Any text of the rest is compared with a model in fuzz/text_fuzz.cpp.
TEST_F(Sanitising, VerifyTextData) {
  const Rows<std::int16_t, Variant, Text> rows = {
      {"Empty, whose lines are not looked at", 5, Variant(), u""},
      {"trimmed before the end at NUL", 0, Text(u" ab \0 cd", 8), u"ab "},
      {"object", 0, holder_of(u" a "), u"a"},
      {"object that holds Null", 0, holder_of(Null{}), u""},
  };
  check_rows(rows, [&](std::int16_t extras, const Variant& data, const Text& expected) {
    EXPECT_EQ(verified(0, extras, data), expected);
  });
  EXPECT_EQ(utils.settings().CounterVerifyText, 2 * static_cast<std::int32_t>(rows.size()));
  // clang-format off
  check({{u"VerifyTextData", {{u"0|0|@null", ""}, {u"0|5|", ""}, {u"0|6|1, 2", "1, 2"}, {u"0|0|=12.5", "12.5"},
          // A line break at the end makes one more line; a lone carriage return or line feed breaks nothing.
          {u"0|5|A\r\n", "A\r\n\r\n"}, {u"0|5|A\rB\nC", "A\rB\nC\r\n"}, {u"0|5|\"", "\r\n"}, {u"2|5|A", "A\r"},
          // A mark may be one that the cleaning made.
          {u"0|5|$*$", ""}, {u"0|5|$*", "$*\r\n"}, {u"0|5|A\r\n$#*$", "A\r\n"}, {u"0|4| \r\n $*$", ""},
          // Lines are joined two at a time, from the end, and a seventh goes.
          {u"0|4|Unit 5\r\nMain Rd", "Unit 5 - Main Rd\r\n"}, {u"0|4|a\r\nb\r\nc", "a\r\nb - c\r\n"},
          {u"0|4|a\r\nb\r\nc\r\nd\r\ne\r\nf\r\ng", "b - c\r\nd - e\r\nf - g\r\n"}}}});
  // clang-format on
}

// An override of a member sees every inner call, in this order.
TEST_F(Sanitising, ToolkitIsCalledInOrder) {
  (void)utils.VerifyTextData(1, 3, u" a,b ");
  const Text replacing = u"StringReplace|a,b|";
  EXPECT_EQ(std::exchange(utils.calls, {}),
            (std::vector<Text>{u"StripNulls|a,b", replacing + u"&|and", replacing + u"\"|", replacing + u"'|\u00B4",
                               replacing + u"\t|", replacing + u"#|", replacing + u">|", replacing + u"<|",
                               replacing + u"?|", replacing + u",|", u"StringReplace|ab| |"}));
  (void)utils.VerifyTextData(0, 3, Null{});
  EXPECT_TRUE(utils.calls.empty());
  (void)utils.VerifyMemField(u"x");
  const Text word = u"StringReplaceWord|x|";
  EXPECT_EQ(utils.calls, (std::vector<Text>{u"StringReplace|x|\n| ", word + u"  | ", word + u"   | ", word + u"    | ",
                                            word + u"\r\n\r\n|\r\n", word + u"\r\n\r\n\r\n|\r\n", word + u"\r\r|\r",
                                            word + u"\r\r\r|\r", word + u"\r\r\r\r|\r"}));
}

TEST_F(Sanitising, CallsAreCountedBeforeTheValueIsLookedAtAndAFullCounterEndsThem) {
  std::int32_t& texts = utils.settings().CounterVerifyText;
  std::int32_t& integers = utils.settings().CounterVerifyInt;
  const Rows<std::int32_t, Variant, std::int32_t> rows = {
      {"error value", 1, missing_argument, 13},
      {"array", 2, ForeignArray{}, 13},
      {"empty object reference", 3, ObjectRef(), 91},
      {"object without a default member", 4, holder_of(std::nullopt), 438},
  };
  check_rows(rows, [&](std::int32_t count, const Variant& data, std::int32_t error) {
    EXPECT_EQ(error_of([&] { (void)utils.VerifyTextData(0, 0, data); }), error);
    EXPECT_EQ(error_of([&] { (void)utils.VerifyIntData(0, data); }), error);
    EXPECT_EQ(std::pair(texts, integers), std::pair(count, count));
  });
  texts = integers = counter_maximum - 1;
  check({{u"VerifyTextData", {{u"0|0|@null", ""}, {u"0|0|@null", "error 6"}}},
         {u"VerifyIntData", {{u"1|@null", "0"}, {u"1|@null", "error 6"}}}});
  EXPECT_EQ(std::pair(texts, integers), std::pair(counter_maximum, counter_maximum));
}

TEST_F(Sanitising, VerifyIntData) {
  check({{u"VerifyIntData",
          {{u"0|@null", ""},
           {u"1|@null", "0"},
           {u"-1|@null", ""},
           {u"0|@empty", "0"},
           {u"0|3.50kg", "3.5"},
           {u"0|=-7", "-7"},
           {u"0|1E999", "error 6"}}}});
  EXPECT_EQ(utils.VerifyIntData(1, holder_of(Null{})), u"0");
  EXPECT_EQ(utils.VerifyIntData(0, holder_of(u"8 St")), u"8");
  platform.separators.decimal_separator = u',';
  platform.separators.thousands_separator = u'.';
  library.start();
  EXPECT_EQ(utils.VerifyIntData(0, u"2.5"), u"2,5");  // Read with the full stop, written with the comma.
  EXPECT_EQ(utils.VerifyIntData(0, 2.5), u"2");       // The number's text has a comma, which ends the reading.
  EXPECT_EQ(utils.VerifyTextData(0, 0, 2.5), u"2,5");
}

TEST_F(Sanitising, VerifyMemField) {
  const auto verified_memo = [&](const Text& text) {
    const Text result = utils.VerifyMemField(text);
    EXPECT_EQ(plain.VerifyMemField(text), result);
    return result;
  };
  EXPECT_EQ(verified_memo(u"\t\"'A\n\nB\r\n\r\nC"), u"\t\"'A B\r \r C");
  EXPECT_EQ(verified_memo(u"A \rB\nC"), u"A \rB C");
  // How many blanks, and how many carriage returns, are left of a run.
  for (const auto& [before, after] : {std::pair(1, 1), {2, 1}, {3, 2}, {4, 2}, {5, 1}, {9, 3}, {16, 1}}) {
    for (const char16_t unit : {u' ', u'\r'}) {
      EXPECT_EQ(verified_memo(Text(std::size_t(before), unit)), Text(std::size_t(after), unit)) << before;
    }
  }
}

}  // namespace
}  // namespace talutil::testing
