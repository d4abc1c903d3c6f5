// What members for texts and lists answer beside what fuzz/text_fuzz.cpp has models for.
#include "tests/fakes/late_members.hpp"

namespace talutil::testing {
namespace {

using TextMembers = LateMembers;

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
  // Looking for the word anew at each position would take minutes here.
  const Text run(1'000'000, u'a');
  const Text word = run.substr(0, 500'000) + u"b";
  EXPECT_EQ(utils.StringReplaceWord(run + u"b", word, u""), run.substr(0, 500'000));
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

}  // namespace
}  // namespace talutil::testing
