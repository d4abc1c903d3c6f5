#include <gtest/gtest.h>

#include <limits>

#include "tests/fakes/recording_control.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {
namespace {

using namespace std::string_view_literals;
using Sanitising = UtilsTest;

constexpr std::int32_t counter_maximum = std::numeric_limits<std::int32_t>::max();

/// An object whose default member has a value, or that has none.
Variant holder_of(std::optional<Variant> value) {
  const auto object = std::make_shared<RecordingControl>();
  if (value) object->values["#" + std::to_string(default_member)] = *value;
  return ObjectRef(object);
}

Text lines(const std::vector<Text>& all) {
  Text text;
  for (const Text& line : all) text.append(line).append(u"\r\n");
  return text;
}

std::vector<Text> split(Text text) {
  std::vector<Text> all;
  for (std::size_t end = 0; (end = text.find(u"\r\n")) != Text::npos; text.erase(0, end + 2)) {
    all.push_back(text.substr(0, end));
  }
  return all.push_back(text), all;
}

/// The cleaning, character by character.
Text cleaned(TextView text, std::int16_t extras = 0) {
  Text result;
  for (const char16_t unit : trim_blanks(text)) {
    const auto code = static_cast<char>(ansi_code(unit));
    if (unit == 0) break;
    if (code == '&')
      result += u"and";
    else if (code == '\'')
      result += u'\u00B4';
    else if (std::string_view("\"\t#><?").find(code) == std::string_view::npos &&
             !(code == ',' && (extras == 1 || extras == 3)) && !(code == ' ' && (extras == 2 || extras == 3)))
      result += unit;
  }
  return result;
}

TEST_F(Sanitising, VerifyTextDataCleansAndCuts) {
  constexpr TextView characters = u"ab  ,,&\"'\t#><?\u2032\uFF03\u3008\u2003\u0416\u20AC\u0100\0"sv;
  Generator generator;
  std::int32_t calls = 0;
  for (; calls < 3000; ++calls) {
    const Text text = generator.text_of(characters, 12);
    const auto extras = static_cast<std::int16_t>(generator.whole(-1, 3));
    const auto width = static_cast<std::int16_t>(generator.whole(-3, 9));
    const Text whole = cleaned(text, extras);
    EXPECT_EQ(utils.VerifyTextData(width, extras, text), width > 0 ? whole.substr(0, std::size_t(width)) : whole)
        << to_utf8(text) << ", extras " << extras << ", width " << width;
  }
  const Rows<std::int16_t, Variant, Text> rows = {
      {"Null", 0, Null{}, u""},
      {"Empty, whose lines are not looked at", 5, Variant(), u""},
      {"empty text", 5, u"", u""},
      {"other extras", 6, u"1, 2", u"1, 2"},
      {"trimmed before the end at NUL", 0, Text(u" ab \0 cd", 8), u"ab "},
      {"number", 0, 12.5, u"12.5"},
      {"object", 0, holder_of(u" a "), u"a"},
      {"object that holds Null", 0, holder_of(Null{}), u""},
      {"a line break at the end makes one more line", 5, u"A\r\n", lines({u"A", u""})},
      {"nothing but a mark", 5, u"$*$", u""},
      {"part of a mark", 5, u"$*", lines({u"$*"})},
      {"a mark that the cleaning made", 5, u"A\r\n$#*$", lines({u"A"})},
      {"lone carriage returns and line feeds break nothing", 5, u"A\rB\nC", lines({u"A\rB\nC"})},
      {"a text that was cleaned away is one empty line", 5, u"\"", lines({u""})},
      {"two short lines", 4, u"Unit 5\r\nMain Rd", lines({u"Unit 5 - Main Rd"})},
      {"two at a time, from the end", 4, u"a\r\nb\r\nc", lines({u"a", u"b - c"})},
      {"a seventh line goes", 4, u"a\r\nb\r\nc\r\nd\r\ne\r\nf\r\ng", lines({u"b - c", u"d - e", u"f - g"})},
      {"nothing is left", 4, u" \r\n $*$", u""},
  };
  check_rows(rows, [&](std::int16_t extras, const Variant& data, const Text& expected) {
    EXPECT_EQ(utils.VerifyTextData(0, extras, data), expected);
  });
  EXPECT_EQ(utils.VerifyTextData(2, 5, u"A"), u"A\r") << "cut within the line break";
  EXPECT_EQ(utils.settings().CounterVerifyText, calls + static_cast<std::int32_t>(rows.size()) + 1);
}

// Marked lines are dropped, the last three others kept; one below 40 is joined to the one before it where both are
// below 73 together.
TEST_F(Sanitising, VerifyTextDataKeepsLinesByTheirLengths) {
  constexpr std::size_t lengths[] = {0, 0, 1, 31, 32, 33, 34, 38, 39, 40, 41, 71, 72};
  Generator generator;
  for (int i = 0; i < 5000; ++i) {
    std::vector<Text> given(static_cast<std::size_t>(generator.whole(1, 7)));
    for (Text& line : given) {
      line = Text(generator.one_of(lengths), static_cast<char16_t>(u'a' + (&line - given.data())));
      if (generator.whole(0, 3) == 0) line = u" " + line + u"  ";
      if (generator.whole(0, 7) == 0) line += u"$*$ ";
    }
    Text text = lines(given);
    text.erase(text.size() - 2);
    text = trim_blanks(text);
    if (text.empty()) continue;
    Text unmarked;
    std::vector<Text> left;
    for (const Text& line : split(text)) {
      const bool is_marked = line.find(u"$*$") != Text::npos;
      left.push_back(is_marked ? u"" : Text(trim_blanks(line)));
      if (!is_marked) unmarked += left.back() + u"\r\n";
    }
    EXPECT_EQ(utils.VerifyTextData(0, 5, text), unmarked) << to_utf8(text);
    std::vector<Text> kept;
    for (; !left.empty() && kept.size() < 3; left.pop_back()) {
      Text line = left.back();
      if (line.empty()) continue;
      Text& before = left[left.size() < 2 ? 0 : left.size() - 2];
      if (left.size() > 1 && !before.empty() && line.size() < 40 && line.size() + before.size() < 73) {
        line = before + u" - " + line;
        before.clear();
      }
      kept.insert(kept.begin(), line);
    }
    EXPECT_EQ(utils.VerifyTextData(0, 4, text), lines(kept)) << to_utf8(text);
  }
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
  EXPECT_EQ(utils.VerifyTextData(0, 0, Null{}), u"");
  EXPECT_EQ(utils.VerifyIntData(1, Null{}), u"0");
  EXPECT_EQ(error_of([&] { (void)utils.VerifyTextData(0, 0, Null{}); }), 6);
  EXPECT_EQ(error_of([&] { (void)utils.VerifyIntData(1, Null{}); }), 6);
  EXPECT_EQ(std::pair(texts, integers), std::pair(counter_maximum, counter_maximum));
}

TEST_F(Sanitising, VerifyIntData) {
  const Rows<std::int16_t, Variant, std::string> rows = {
      {"Null", 0, Null{}, ""},
      {"Null with the flag", 1, Null{}, "0"},
      {"Null with another flag", -1, Null{}, ""},
      {"object that holds Null", 1, holder_of(Null{}), "0"},
      {"Empty", 0, Variant(), "0"},
      {"trailing zero and unit", 0, u"3.50kg", "3.5"},
      {"number", 0, std::int16_t{-7}, "-7"},
      {"object", 0, holder_of(u"8 St"), "8"},
      {"too large", 0, u"1E999", "error 6"},
  };
  check_rows(rows, [&](std::int16_t flag, const Variant& data, const std::string& answer) {
    EXPECT_EQ(outcome([&] { return utils.VerifyIntData(flag, data); }), answer);
  });
  platform.separators.decimal_separator = u',';
  platform.separators.thousands_separator = u'.';
  library.start();
  EXPECT_EQ(utils.VerifyIntData(0, u"2.5"), u"2,5");  // Read with the full stop, written with the comma.
  EXPECT_EQ(utils.VerifyIntData(0, 2.5), u"2");       // The number's text has a comma, which ends the reading.
  EXPECT_EQ(utils.VerifyTextData(0, 0, 2.5), u"2,5");
}

TEST_F(Sanitising, VerifyMemField) {
  EXPECT_EQ(utils.VerifyMemField(u"\t\"'A\n\nB\r\n\r\nC"), u"\t\"'A B\r \r C");
  // How many blanks, and how many carriage returns, are left of a run.
  const struct { std::size_t before, after; } runs[] = {{1, 1}, {2, 1}, {3, 2}, {4, 2}, {5, 1}, {9, 3}, {16, 1}};
  for (const auto& run : runs) {
    EXPECT_EQ(utils.VerifyMemField(Text(run.before, u' ')), Text(run.after, u' ')) << run.before;
    EXPECT_EQ(utils.VerifyMemField(Text(run.before, u'\r')), Text(run.after, u'\r')) << run.before;
  }
}

}  // namespace
}  // namespace talutil::testing
