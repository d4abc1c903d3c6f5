// The members for texts and lists: compared with loops over their characters, and the answers that no loop explains.
#include <algorithm>

#include "tests/fakes/late_members.hpp"

namespace talutil::testing {
namespace {

class TextMembers : public LateMembers {
 protected:
  /// The characters whose code answers yes.
  template <class Predicate>
  static Text kept(TextView text, Predicate keep) {
    Text result;
    for (const char16_t unit : text) {
      if (keep(ansi_code(unit))) result += unit;
    }
    return result;
  }
  static Text replaced(TextView text, char16_t from, TextView to) {
    Text result;
    for (const char16_t unit : text) ansi_code(unit) == ansi_code(from) ? result += to : result += unit;
    return result;
  }
  static bool is_digit(int code) { return code >= '0' && code <= '9'; }

  Generator generator;
};

// Each kind of character that a member tells from others, at its edges, and others that count as one of them.
using namespace std::string_view_literals;
constexpr TextView alphabet =
    u"/09:@AZ[`az{ ,.-'\"\t\r\n&#<>?\u00B4\u20AC\u2032\uFF03\u2003\u2085\uFF21\u0100\u0416\u4E2D\0"sv;

TEST_F(TextMembers, PassOverCharactersByTheirCodes) {
  // Long texts are searched in blocks of 32.
  for (const std::int32_t longest : {2, 12, 70}) {
    for (int i = 0; i < 1000; ++i) {
      const Text text = generator.text_of(i % 2 == 0 ? alphabet : u"0123456789ABC.Z", longest);
      const char16_t one = generator.one_of(alphabet);
      const Text to = generator.text_of(alphabet, 2);
      SCOPED_TRACE(to_utf8(text) + " by " + to_utf8(Text(1, one)) + " to " + to_utf8(to));
      const auto has = [&](auto what) {
        return std::ranges::any_of(text, [&](char16_t c) { return what(ansi_code(c)); });
      };
      EXPECT_EQ(utils.StringReplace(text, Text(1, one) + to, to), replaced(text, one, to));
      EXPECT_EQ(utils.CRLFStringReplace(text, u"-"), replaced(replaced(text, u'\r', u"-"), u'\n', u"-"));
      EXPECT_EQ(utils.StripNulls(text), text.substr(0, text.find(u'\0')));
      EXPECT_EQ(utils.RemoveNumberFromString(text), kept(text, [](int code) { return code >= 'A'; }));
      Text none;
      Text character(1, one);
      EXPECT_EQ(utils.RemoveStringsFromNumber(0, text, none), kept(text, is_digit));
      EXPECT_EQ(utils.RemoveStringsFromNumber(1, text, none),
                kept(text, [](int c) { return is_digit(c) || c == ' '; }));
      EXPECT_EQ(utils.RemoveStringsFromNumber(3, text, none),
                kept(text, [](int c) { return is_digit(c) || c == '.'; }));
      Text others = text;
      std::erase(others, one);
      EXPECT_EQ(utils.RemoveStringsFromNumber(2, text, character), others);
      EXPECT_EQ(utils.ReverseString(text), Text(text.rbegin(), text.rend()));
      EXPECT_EQ(utils.NumbersInString(text), Boolean(has(is_digit)));
      EXPECT_EQ(utils.IsValueNumber(text),
                Boolean(!text.empty() && !has([](int code) { return !is_digit(code) && code != '.'; })));
      EXPECT_EQ(utils.VerifyPasswordText(text),
                Boolean(!has([](int code) { return !is_digit(code) && (code < 'A' || code > 'Z'); })));
    }
  }
}

TEST_F(TextMembers, ReadListsFieldByField) {
  for (int i = 0; i < 3000; ++i) {
    const Text list = generator.text_of(u"Aa,,;", 12);
    const Text delimiter(1, generator.one_of(TextView(u",;")));
    const Text wanted = generator.text_of(u"Aa", 2);
    SCOPED_TRACE(to_utf8(list) + " by " + to_utf8(delimiter) + " for " + to_utf8(wanted));
    // Where each delimiter is, and the fields that they close; what comes after the last is none.
    std::vector<std::int32_t> positions;
    std::vector<Text> fields(1);
    for (std::size_t at = 0; at < list.size(); ++at) {
      if (list[at] != delimiter[0]) {
        fields.back() += list[at];
        continue;
      }
      positions.push_back(static_cast<std::int32_t>(at) + 1);
      fields.emplace_back();
    }
    fields.pop_back();
    const auto count = static_cast<std::int32_t>(fields.size());
    EXPECT_EQ(utils.SubStrCount(delimiter, list), count);
    for (std::int32_t n = 1; n <= count + 1; ++n) {
      EXPECT_EQ(utils.MyPos(delimiter, list, n), n <= count ? positions[static_cast<std::size_t>(n - 1)] : 0);
    }
    EXPECT_EQ(utils.MyInstrDelim(wanted, list, delimiter), Boolean(std::ranges::count(fields, wanted) > 0));
    const TextArray before = generator.whole(0, 1) == 0 ? TextArray{} : array_of({u"1", u"2", u"3"});
    TextArray read = before;
    EXPECT_EQ(utils.ReadCommaDelimStrToList(list, read, delimiter), count);
    EXPECT_EQ(read, count == 0 ? before : array_of(fields));
    const auto with_wanted = std::ranges::find_if(fields, [&](const Text& field) {
      return upper_case(TextView(field)).starts_with(upper_case(TextView(wanted)));
    });
    if (count > 0) {
      EXPECT_EQ(utils.IndexInList(read, wanted), with_wanted == fields.end() ? -1 : with_wanted - fields.begin());
    }
    if (delimiter != u",") continue;
    Text joined;
    const std::int32_t first = generator.whole(0, count);
    for (std::int32_t end = first + 1; end <= count; ++end) {
      joined += fields[static_cast<std::size_t>(end - 1)];
      EXPECT_EQ(utils.GetData(list, first, end), joined) << first << " to " << end;
      joined += u',';
    }
    EXPECT_EQ(utils.GetData(list, first, count + 1), u"") << "after the last comma there is nothing";
  }
}

TEST_F(TextMembers, ReplaceWordsFromTheLeft) {
  for (int i = 0; i < 20'000; ++i) {
    // Words of up to eight characters, and longer ones.
    const Text word = generator.text_of(i % 2 == 0 ? u"ab" : u"ab\r", 12);
    const auto part = [&] {
      return static_cast<std::size_t>(generator.whole(0, static_cast<std::int32_t>(word.size())));
    };
    // Half of the texts nearly have the word, where a search must fall back to a shorter beginning of it.
    const Text text = i % 2 == 0 ? word.substr(0, part()) + word.substr(part()) + word : generator.text_of(u"ab\r", 16);
    const Text to = generator.text_of(u"abA", 3);
    Text expected = text;
    for (std::size_t at = 0; !word.empty() && (at = expected.find(word, at)) != Text::npos; at += to.size()) {
      expected.replace(at, word.size(), to);
    }
    EXPECT_EQ(utils.StringReplaceWord(text, word, to), expected) << to_utf8(text + u'|' + word + u'|' + to);
    // A marker stands for a line break, and the character after it for nothing; one at the end stays behind it.
    Text restored;
    for (std::size_t at = 0; at < text.size(); ++at) {
      restored += text[at] == u'a' ? u"\r\n" : Text(1, text[at]);
      if (text[at] == u'a' && ++at == text.size()) restored += u'a';
    }
    EXPECT_EQ(utils.StringRestoreCRLF(text, u"a"), restored) << to_utf8(text);
  }
  // Looking for the word anew at each position would take minutes here.
  const Text run(1'000'000, u'a');
  const Text word = run.substr(0, 500'000) + u"b";
  EXPECT_EQ(utils.StringReplaceWord(run + u"b", word, u""), run.substr(0, 500'000));
}

// What hosts rely on, or what has always been so. StringPosition's window behind the third blank is empty.
TEST_F(TextMembers, AnswerOddQuestionsAsEver) {
  // clang-format off
  check({
    {u"RemoveStringsFromNumber", {{u"2|ABAB|AB", "ABAB"}, {u"2||", ""}, {u"4|/a0 9|x", ""}}},
    {u"StringReplace", {{u"a||x", "error 5"}, {u"||x", ""}}},
    {u"CRLFStringReplace", {{u"A\r\nB|\n.", "A\n..\n.B"}}},
    {u"StringRestoreCRLF", {{u"AxyB|xy", "AxyB"}, {u"A\u2032\u2032|'", "A\xE2\x80\xB2\xE2\x80\xB2"}, {u"AB|", "AB"}}},
    {u"AddZeros", {{u"7|3|0", "7"}, {u"7|3|-2", "7"}, {u"123|3|1", "123"},
     {u"|-1|-1", ""}}},
    {u"GetData", {{u"A,B,|-1|1", ""}, {u"A,B,|1|-1", ""}, {u"A,B|0|0", ""}, {u"A,B,|1|1", "error 5"},
     {u"A,B,|1|0", "error 5"}}},
    {u"MyPos", {{u",|A,B|0", "1"}, {u",|,B|0", "0"}, {u",|A,B|-1", "0"}, {u"AB|ABAB|1", "0"}, {u"|AB|1", "0"},
     {u"|AB|0", "1"}, {u"'|\u2032'|1", "2"}}},
    {u"SubStrCount", {{u"AB|ABAB", "0"}, {u"|AB", "0"}}},
    {u"MyInstrDelim", {{u"|A|", "False"}, {u"A|A\u2032|'", "False"}}},
    {u"StringPosition", {{u"12 SMITH ST|0", "0"}, {u"UNIT 4 12 SMITH|1", "10"},
     {u"A SMI5TH|1", "0"}, {u"A SMIT5H|1", "2"}, {u"A SMI\u2085TH|1", "0"}, {u"A 5MITH|1", "0"}}},
    {u"IsValueDate", {{u"15-11-2024", "True"}, {u"1/3/24", "True"}, {u"99/99/9999", "True"}, {u"12//2024", "False"},
     {u"1/123/2024", "True"}, {u"1//2024", "False"}, {u"123/1/2024", "False"},
     {u"1/1/", "False"}, {u"1/1/2024 10:00", "False"}, {u"x/1/2024", "False"}, {u"", "False"}}},
    {u"IsValueTime", {{u"25:99", "True"}, {u"930", "False"}, {u":30", "False"}, {u"9:", "False"},
     {u"009:30", "False"}}},
    {u"VerifyEmail", {{u".@", "True"}, {u"a.b", "False"}, {u"a@b", "False"}}},
  });
  // clang-format on
}

TEST_F(TextMembers, TakeArraysByTheirBounds) {
  const Rows<TextArray, Text, Text, std::int32_t, TextArray> reads = {
      {"two characters are no delimiter", array_of({u"1"}), u"A,,B", u",,", 0, array_of({u"1"})},
      {"exact, not by code", array_of({u"1"}), u"A\u2032B", u"'", 0, array_of({u"1"})},
      {"lower bound 1", array_of({u"1"}, 1), u"A,", u",", 9, array_of({u"1"}, 1)},
      {"lower bound below 0", array_of({u"1"}, -1), u"A,", u",", 9, array_of({u"1"}, -1)},
  };
  check_rows(reads, [&](TextArray list, const Text& text, const Text& delimiter, int error, const TextArray& after) {
    EXPECT_EQ(error_of([&] { EXPECT_EQ(utils.ReadCommaDelimStrToList(text, list, delimiter), 0); }), error);
    EXPECT_EQ(list, after);
  });
  TextArray own = array_of({u"A,B,", u"x"});
  EXPECT_EQ(utils.ReadCommaDelimStrToList(own.items[0], own, u","), 2) << "an element of its own";

  const Rows<TextArray, Text, std::string> looks = {
      {"accents have case too", array_of({u"Ba", u"\u00C9clair"}), u"\u00E9CL", "1"},
      {"elements below 0 are not looked at", array_of({u"x", u"y"}, -1), u"", "0"},
      {"lower bound 1", array_of({u"Apple"}, 1), u"App", "error 9"},
      {"unallocated", {}, u"App", "error 9"},
  };
  check_rows(looks, [&](const TextArray& list, const Text& text, const std::string& answer) {
    EXPECT_EQ(outcome([&] { return utils.IndexInList(list, text); }), answer);
  });
}

TEST_F(TextMembers, TakeLongTexts) {
  const Text longest(32767, u'7');
  const Text longer(32768, u'7');
  EXPECT_EQ(utils.ReverseString(longest), longest);
  EXPECT_EQ(utils.StringRestoreCRLF(longest, u"x"), longest);
  EXPECT_EQ(utils.MyInstrDelim(u"x", longest, u","), Boolean(false));
  EXPECT_EQ(utils.StringPosition(longest.substr(1) + u" ", 1), 32767);
  EXPECT_EQ(error_of([&] { (void)utils.ReverseString(longer); }), 6);
  EXPECT_EQ(error_of([&] { (void)utils.StringRestoreCRLF(longer, u"x"); }), 6);
  EXPECT_EQ(error_of([&] { (void)utils.MyInstrDelim(u"x", longer, u","); }), 6);
  EXPECT_EQ(error_of([&] { (void)utils.StringPosition(longest + u" ", 1); }), 6);
}

TEST_F(TextMembers, CallOneAnotherInOrder) {
  // Three calls of GetData, of which the second has no start to ask for and the third finds none.
  check({{u"GetData", {{u"A,B,|1|2", "B"}, {u"A,|0|1", "A"}, {u"A|1|2", ""}}},
         {u"CRLFStringReplace", {{u"A\r\nB|.", "A..B"}}},
         {u"StringPosition", {{u"1 2 x y z|1", "4"}}}});
  EXPECT_EQ(utils.calls,
            (std::vector<Text>{u"MyPos|,|A,B,|1", u"MyPos|,|A,B,|2", u"MyPos|,|A,|1", u"MyPos|,|A|1", u"MyPos|,|A|2",
                               u"StringReplace|A\r\nB|\r|.", u"StringReplace|A.\nB|\n|.", u"SubStrCount| |1 2 X Y Z",
                               u"MyPos| |1 2 X Y Z|1", u"MyPos| |1 2 X Y Z|2"}));
}

// An object whose members may be overridden searches for each blank by a call of MyPos.
TEST_F(TextMembers, StringPositionIsTheSameWhereNobodySeesItsCalls) {
  ORVUtils plain(library);
  for (int i = 0; i < 3000; ++i) {
    const Text text = generator.text_of(u"ab  1", 14);
    EXPECT_EQ(plain.StringPosition(text, 1), utils.StringPosition(text, 1)) << to_utf8(text);
  }
}

}  // namespace
}  // namespace talutil::testing
