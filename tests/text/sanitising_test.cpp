#include <gtest/gtest.h>

#include <limits>

#include "tests/text/recording_utils.hpp"

namespace talutil::testing {
namespace {

constexpr std::int32_t counter_maximum = std::numeric_limits<std::int32_t>::max();

/// An object whose default member gives one value, or that has none.
class Holder final : public Object {
 public:
  explicit Holder(std::optional<Variant> value) : value_(std::move(value)) {}
  std::int32_t member_id(TextView) override { raise(ErrorNumber::member_not_supported); }
  Variant invoke(std::int32_t member, Access, std::span<const Variant>) override {
    if (member != default_member || !value_) raise(ErrorNumber::member_not_supported);
    return *value_;
  }

 private:
  std::optional<Variant> value_;
};

Variant holder_of(std::optional<Variant> value) { return ObjectRef(std::make_shared<Holder>(std::move(value))); }

Text lines(std::initializer_list<Text> all) {
  Text text;
  for (const Text& line : all) text.append(line).append(u"\r\n");
  return text;
}

struct TextRow {
  const char* name;
  std::int16_t width, extras;
  Variant data;
  Text expected;
};

class Sanitising : public TextMembersTest {
 protected:
  void expect_cleaned(std::span<const TextRow> rows) {
    for (const TextRow& row : rows)
      EXPECT_EQ(utils.VerifyTextData(row.width, row.extras, row.data), row.expected) << row.name;
  }
};

TEST_F(Sanitising, VerifyTextData) {
  const TextRow rows[] = {
      {"Null", 0, 0, Null{}, u""},
      {"Empty, whose lines are not looked at", 0, 5, Variant(), u""},
      {"empty text", 0, 5, u"", u""},
      {"trimmed, cleaned, cut", 10, 0, u"  O'Brien & Sons  ", u"O\u00B4Brien an"},
      {"all that goes", 0, 0, u"a\"b\tc#d>e<f?g", u"abcdefg"},
      {"tabs hide blanks from the trim", 0, 0, u"\t a \t", u" a "},
      {"trimmed before the end at NUL", 0, 0, Text(u" ab \0 cd", 8), u"ab "},
      {"substitutes of what goes", 0, 0, u"a\u2032b\uFF03c\u3008d", u"a\u00B4bcd"},
      {"characters without a substitute count as question marks", 0, 0, u"\u0416\u20AC\u4E2D\u0100", u"\u20AC\u0100"},
      {"commas", 0, 1, u"1, 2 ,3", u"1 2 3"},
      {"blanks, the wide one too", 0, 2, u"1, 2\u2003,3", u"1,2,3"},
      {"commas and blanks", 0, 3, u"1, 2 ,3", u"123"},
      {"other extras", 0, 6, u"1, 2", u"1, 2"},
      {"exactly the width", 3, 0, u"abc", u"abc"},
      {"negative width", -3, 0, u"abcd", u"abcd"},
      {"number", 0, 0, 12.5, u"12.5"},
      {"object", 0, 0, holder_of(u" a "), u"a"},
      {"object that holds Null", 0, 0, holder_of(Null{}), u""},
  };
  expect_cleaned(rows);
  EXPECT_EQ(utils.settings().CounterVerifyText, static_cast<std::int32_t>(std::size(rows)));
}

TEST_F(Sanitising, VerifyTextDataDropsMarkedLines) {
  const TextRow rows[] = {
      {"marked lines vanish, the others are trimmed", 0, 5, u"A\r\nx $*$ y\r\n B ", lines({u"A", u"B"})},
      {"a line break at the end makes one more line", 0, 5, u"A\r\n", lines({u"A", u""})},
      {"empty lines stay", 0, 5, u"A\r\n\r\nB", lines({u"A", u"", u"B"})},
      {"nothing but a mark", 0, 5, u"$*$", u""},
      {"part of a mark", 0, 5, u"$*", lines({u"$*"})},
      {"a mark that the cleaning made", 0, 5, u"A\r\n$#*$", lines({u"A"})},
      {"lone carriage returns and line feeds break nothing", 0, 5, u"A\rB\nC", lines({u"A\rB\nC"})},
      {"a text that was cleaned away is one empty line", 0, 5, u"\"", lines({u""})},
      {"cut within the line break", 2, 5, u"A", u"A\r"},
  };
  expect_cleaned(rows);
}

TEST_F(Sanitising, VerifyTextDataCompressesToThreeLines) {
  const auto run = [](char16_t letter, std::size_t length) { return Text(length, letter); };
  const auto pair = [](const Text& first, const Text& second) { return first + u"\r\n" + second; };
  const Text a = run(u'a', 45), b = run(u'b', 45), c = run(u'c', 45), d = run(u'd', 45), e = run(u'e', 45);
  const TextRow rows[] = {
      {"two short lines", 0, 4, u"Unit 5\r\nMain Rd", lines({u"Unit 5 - Main Rd"})},
      {"the last three of five long lines", 0, 4, lines({a, b, c, d, e}), lines({c, d, e})},
      {"empty lines do not count", 0, 4, lines({u"", a, u" ", b, u"", c, u""}), lines({a, b, c})},
      {"39 joins, 72 together", 0, 4, pair(run(u'a', 33), run(u'b', 39)),
       lines({run(u'a', 33) + u" - " + run(u'b', 39)})},
      {"73 together do not", 0, 4, pair(run(u'a', 34), run(u'b', 39)), lines({run(u'a', 34), run(u'b', 39)})},
      {"40 does not join", 0, 4, pair(u"a", run(u'b', 40)), lines({u"a", run(u'b', 40)})},
      {"the line before may be longer", 0, 4, pair(run(u'a', 70), u"bb"), lines({run(u'a', 70) + u" - bb"})},
      {"lengths without the blanks around", 0, 4, pair(u" " + run(u'a', 33), run(u'b', 39) + u"  "),
       lines({run(u'a', 33) + u" - " + run(u'b', 39)})},
      {"two at a time, from the end", 0, 4, u"a\r\nb\r\nc", lines({u"a", u"b - c"})},
      {"a joined pair counts once, a seventh line goes", 0, 4, u"a\r\nb\r\nc\r\nd\r\ne\r\nf\r\ng",
       lines({u"b - c", u"d - e", u"f - g"})},
      {"an empty line keeps its neighbours apart", 0, 4, u"a\r\n\r\nb", lines({u"a", u"b"})},
      {"a marked line does so too", 0, 4, u"a\r\nx $*$\r\nb", lines({u"a", u"b"})},
      {"a mark in the first line", 0, 4, u"$*$\r\nb", lines({u"b"})},
      {"nothing is left", 0, 4, u" \r\n $*$", u""},
  };
  expect_cleaned(rows);
}

// An override of a member sees every inner call, in this order.
TEST_F(Sanitising, ToolkitIsCalledInOrder) {
  (void)utils.VerifyTextData(1, 3, u" a,b c ");
  EXPECT_EQ(utils.calls,
            (std::vector<Text>{u"StripNulls|a,b c", u"StringReplace|a,b c|&|and", u"StringReplace|a,b c|\"|",
                               u"StringReplace|a,b c|'|\u00B4", u"StringReplace|a,b c|\t|", u"StringReplace|a,b c|#|",
                               u"StringReplace|a,b c|>|", u"StringReplace|a,b c|<|", u"StringReplace|a,b c|?|",
                               u"StringReplace|a,b c|,|", u"StringReplace|ab c| |"}));
  utils.calls.clear();
  (void)utils.VerifyTextData(0, 3, Null{});
  EXPECT_TRUE(utils.calls.empty());
  (void)utils.VerifyMemField(u"x");
  EXPECT_EQ(utils.calls,
            (std::vector<Text>{u"StringReplace|x|\n| ", u"StringReplaceWord|x|  | ", u"StringReplaceWord|x|   | ",
                               u"StringReplaceWord|x|    | ", u"StringReplaceWord|x|\r\n\r\n|\r\n",
                               u"StringReplaceWord|x|\r\n\r\n\r\n|\r\n", u"StringReplaceWord|x|\r\r|\r",
                               u"StringReplaceWord|x|\r\r\r|\r", u"StringReplaceWord|x|\r\r\r\r|\r"}));
}

TEST_F(Sanitising, CallsAreCountedBeforeTheValueIsLookedAt) {
  const struct {
    const char* name;
    Variant data;
    std::int32_t error;
  } rows[] = {
      {"error value", missing_argument, 13},
      {"array", ForeignArray{}, 13},
      {"empty object reference", ObjectRef(), 91},
      {"object without a default member", holder_of(std::nullopt), 438},
  };
  std::int32_t count = 0;
  for (const auto& row : rows) {
    EXPECT_EQ(error_of([&] { (void)utils.VerifyTextData(0, 0, row.data); }), row.error) << row.name;
    EXPECT_EQ(error_of([&] { (void)utils.VerifyIntData(0, row.data); }), row.error) << row.name;
    ++count;
    EXPECT_EQ(utils.settings().CounterVerifyText, count) << row.name;
    EXPECT_EQ(utils.settings().CounterVerifyInt, count) << row.name;
  }
}

TEST_F(Sanitising, AFullCounterEndsTheCall) {
  utils.settings().CounterVerifyText = counter_maximum;
  utils.settings().CounterVerifyInt = counter_maximum - 1;
  EXPECT_EQ(error_of([&] { (void)utils.VerifyTextData(0, 0, Null{}); }), 6);
  EXPECT_EQ(utils.VerifyIntData(1, Null{}), u"0");
  EXPECT_EQ(error_of([&] { (void)utils.VerifyIntData(1, Null{}); }), 6);
  EXPECT_EQ(utils.settings().CounterVerifyText, counter_maximum);
  EXPECT_EQ(utils.settings().CounterVerifyInt, counter_maximum);
}

TEST_F(Sanitising, VerifyIntData) {
  const struct {
    const char* name;
    std::int16_t flag;
    Variant data;
    Text expected;
  } rows[] = {
      {"Null", 0, Null{}, u""},
      {"Null with the flag", 1, Null{}, u"0"},
      {"Null with another flag", -1, Null{}, u""},
      {"object that holds Null", 1, holder_of(Null{}), u"0"},
      {"Empty", 0, Variant(), u"0"},
      {"trailing zero and unit", 0, u"3.50kg", u"3.5"},
      {"number", 0, std::int16_t{-7}, u"-7"},
      {"object", 0, holder_of(u"8 St"), u"8"},
  };
  for (const auto& row : rows) EXPECT_EQ(utils.VerifyIntData(row.flag, row.data), row.expected) << row.name;
  EXPECT_EQ(error_of([&] { (void)utils.VerifyIntData(0, u"1E999"); }), 6);
}

TEST_F(Sanitising, NumbersAreWrittenWithTheUsersSeparator) {
  platform.separators.decimal_separator = u',';
  platform.separators.thousands_separator = u'.';
  library.start();
  EXPECT_EQ(utils.VerifyIntData(0, u"2.5"), u"2,5");  // Read with the full stop, written with the comma.
  EXPECT_EQ(utils.VerifyIntData(0, 2.5), u"2");       // The number's text has a comma, which ends the reading.
  EXPECT_EQ(utils.VerifyTextData(0, 0, 2.5), u"2,5");
}

TEST_F(Sanitising, VerifyMemField) {
  const struct {
    const char* name;
    Text memo, expected;
  } rows[] = {
      {"line break", u"A\r\nB", u"A\r B"},
      {"line feeds join the blanks around", u"A\n\nB", u"A B"},
      {"two line breaks", u"A\r\n\r\nB", u"A\r \r B"},
      {"tabs and quotes stay", u"\t\"'", u"\t\"'"},
  };
  for (const auto& row : rows) EXPECT_EQ(utils.VerifyMemField(row.memo), row.expected) << row.name;

  // How many blanks, and how many carriage returns, are left of a run.
  const struct { std::size_t before, after; } runs[] = {{1, 1}, {2, 1}, {3, 2}, {4, 2}, {5, 1}, {9, 3}, {16, 1}};
  for (const auto& run : runs) {
    EXPECT_EQ(utils.VerifyMemField(Text(run.before, u' ')), Text(run.after, u' ')) << run.before;
    EXPECT_EQ(utils.VerifyMemField(Text(run.before, u'\r')), Text(run.after, u'\r')) << run.before;
  }
}

}  // namespace
}  // namespace talutil::testing
