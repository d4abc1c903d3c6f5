#include <gtest/gtest.h>

#include "tests/text/recording_utils.hpp"

namespace talutil::testing {
namespace {

using StringToolkit = TextMembersTest;

TEST_F(StringToolkit, StripNulls) {
  const struct {
    const char* name;
    Text s, expected;
  } rows[] = {
      {"none", u"A B", u"A B"},
      {"the first of two ends the text", Text(u"A\0B\0", 4), u"A"},
      {"at the start", Text(u"\0A", 2), u""},
  };
  for (const auto& row : rows) EXPECT_EQ(utils.StripNulls(row.s), row.expected) << row.name;
}

TEST_F(StringToolkit, RemoveNumberFromString) {
  const struct {
    const char* name;
    Text text, expected;
  } rows[] = {
      {"the edge lies between @ and A", u"9:;@A[`a{~ \t", u"A[`a{~"},
      {"upper half of the code page stays", u"\u00B4\u20AC\u2019", u"\u00B4\u20AC\u2019"},
      {"a substitute of 65 or more stays", u"\u0100\uFF21", u"\u0100\uFF21"},
      {"a digit as substitute goes, and so does a character without one", u"\u2080\u0416x", u"x"},
  };
  for (const auto& row : rows) EXPECT_EQ(utils.RemoveNumberFromString(row.text), row.expected) << row.name;
}

TEST_F(StringToolkit, RemoveStringsFromNumber) {
  const Text mixed = u"/a0 9:.-5\u2003";
  const struct {
    const char* name;
    std::int16_t option;
    Text text, character, expected, character_after;
  } rows[] = {
      {"digits", 0, mixed, u"", u"095", u""},
      {"digits and blanks, the wide blank too", 1, mixed, u"", u"0 95\u2003", u""},
      {"digits and full stops", 3, mixed, u"", u"09.5", u""},
      {"a digit by its substitute", 0, u"a\u2074", u"", u"\u2074", u""},
      {"no character: blanks go and the blank is written back", 2, u"A B", u"", u"AB", u" "},
      {"a character, exactly", 2, u"AaA\u0100", u"A", u"a\u0100", u"A"},
      {"two characters remove nothing", 2, u"ABAB", u"AB", u"ABAB", u"AB"},
      {"no text: nothing is written back", 2, u"", u"", u"", u""},
      {"unknown option", 4, mixed, u"x", u"", u"x"},
  };
  for (const auto& row : rows) {
    Text character = row.character;
    EXPECT_EQ(utils.RemoveStringsFromNumber(row.option, row.text, character), row.expected) << row.name;
    EXPECT_EQ(character, row.character_after) << row.name;
  }
}

TEST_F(StringToolkit, StringReplace) {
  const Text plain(100, u'.');
  const struct {
    const char* name;
    Text source, character, replacement, expected;
  } rows[] = {
      {"only the first character of sChr counts", u"abab", u"ab", u"-+", u"-+b-+b"},
      {"replacement holds the character", u"a&b&", u"&", u"&&", u"a&&b&&"},
      {"across blocks", plain + u"," + plain + u",", u",", u"", plain + plain},
      {"the last character of a block", plain.substr(0, 31) + u"x" + plain, u"x", u"", plain.substr(0, 31) + plain},
      {"best fit of the text", u"1\u2032", u"'", u"-", u"1-"},
      {"best fit of sChr", u"'\u2032", u"\u2032", u"-", u"--"},
      {"a question mark takes all without a substitute", u"?\u0416\u4E2D\u0100", u"?", u"", u"\u0100"},
      {"no source, whatever the character", u"", u"", u"x", u""},
      {"upper block by its own character", u"\u20AC\x0080\x0081", u"\u20AC", u"E", u"E\x0080\x0081"},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(utils.StringReplace(row.source, row.character, row.replacement), row.expected) << row.name;
  }
  EXPECT_EQ(error_of([&] { (void)utils.StringReplace(u"a", u"", u"x"); }), 5);
}

TEST_F(StringToolkit, CrlfStringReplaceReplacesLineFeedsOfItsOwnToo) {
  EXPECT_EQ(utils.CRLFStringReplace(u"A\r\nB", u"\n."), u"A\n..\n.B");
  const std::vector<Text> calls = {u"StringReplace|A\r\nB|\r|\n.", u"StringReplace|A\n.\nB|\n|\n."};
  EXPECT_EQ(utils.calls, calls);
}

TEST_F(StringToolkit, StringRestoreCrlf) {
  const struct {
    const char* name;
    Text source, marker, expected;
  } rows[] = {
      {"pair", u"AxxB", u"x", u"A\r\nB"},
      {"whatever follows a marker is skipped", u"AxBC", u"x", u"A\r\nC"},
      {"a marker at the end stays", u"ABx", u"x", u"AB\r\nx"},
      {"three at the end", u"xxx", u"x", u"\r\n\r\nx"},
      {"two characters are no marker", u"AxyB", u"xy", u"AxyB"},
      {"exact, not by code", u"A\u2032\u2032", u"'", u"A\u2032\u2032"},
      {"no marker", u"AB", u"", u"AB"},
  };
  for (const auto& row : rows) EXPECT_EQ(utils.StringRestoreCRLF(row.source, row.marker), row.expected) << row.name;
}

TEST_F(StringToolkit, AddZeros) {
  const struct {
    const char* name;
    Text text;
    std::int16_t length, justify;
    Text expected;
  } rows[] = {
      {"before", u"7", 3, -1, u"007"},        {"after", u"7", 3, 1, u"700"},      {"other", u"7", 3, 0, u"7"},
      {"other, below -1", u"7", 3, -2, u"7"}, {"longer", u"1234", 3, 1, u"1234"}, {"negative length", u"", -1, -1, u""},
  };
  for (const auto& row : rows) EXPECT_EQ(utils.AddZeros(row.text, row.length, row.justify), row.expected) << row.name;
}

TEST_F(StringToolkit, SixteenBitMembersTake32767Characters) {
  const Text longest(32767, u'a');
  const Text too_long(32768, u'a');
  EXPECT_EQ(utils.ReverseString(longest), longest);
  EXPECT_EQ(utils.StringRestoreCRLF(longest, u"x"), longest);
  EXPECT_EQ(utils.MyInstrDelim(u"x", longest, u","), Boolean(false));
  EXPECT_EQ(error_of([&] { (void)utils.ReverseString(too_long); }), 6);
  EXPECT_EQ(error_of([&] { (void)utils.StringRestoreCRLF(too_long, u"x"); }), 6);
  EXPECT_EQ(error_of([&] { (void)utils.MyInstrDelim(u"x", too_long, u","); }), 6);
}

TEST_F(StringToolkit, StringReplaceWord) {
  const struct {
    const char* name;
    Text source, from, to, expected;
  } rows[] = {
      {"inside words too", u"cat concat", u"cat", u"dog", u"dog condog"},
      {"from the left, without overlap", u"aaaaa", u"aa", u"b", u"bba"},
      {"the replacement is not searched again", u"ab", u"a", u"aa", u"aab"},
      {"a false start that overlaps the word", u"aabaabaaf", u"aabaaf", u"-", u"aab-"},
      {"a border after a match is not carried over", u"abababa", u"aba", u"-", u"-b-"},
      {"not by code", u"\u2032", u"'", u"-", u"\u2032"},
      {"case counts", u"Cat", u"cat", u"dog", u"Cat"},
      {"cut off at the end", u"xab", u"abc", u"-", u"xab"},
      {"empty word", u"ab", u"", u"-", u"ab"},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(utils.StringReplaceWord(row.source, row.from, row.to), row.expected) << row.name;
  }
}

// Looking for the word anew at each position would take minutes here.
TEST_F(StringToolkit, StringReplaceWordIsNotSlowedDownByRepetition) {
  const Text run(1'000'000, u'a');
  const Text word = run.substr(0, 500'000) + u"b";
  EXPECT_EQ(utils.StringReplaceWord(run, word, u""), run);
  EXPECT_EQ(utils.StringReplaceWord(run + u"b", word, u""), run.substr(0, 500'000));
}

}  // namespace
}  // namespace talutil::testing
