#include <gtest/gtest.h>

#include "tests/text/recording_utils.hpp"

namespace talutil::testing {
namespace {

using Lists = TextMembersTest;

TextArray array_of(std::vector<Text> items, std::int32_t lower_bound = 0) {
  return {.items = std::move(items), .lower_bound = lower_bound, .allocated = true};
}

TEST_F(Lists, GetData) {
  const struct {
    const char* name;
    Text list;
    std::int32_t start, end;
    Text expected;
    std::int32_t error = 0;
  } rows[] = {
      {"first field", u"A,B,C,", 0, 1, u"A"},
      {"field between commas", u"A,B,C,", 1, 2, u"B"},
      {"several fields", u"A,B,C,", 0, 3, u"A,B,C"},
      {"empty field", u"A,,C,", 1, 2, u""},
      {"after the last comma there is nothing", u"A,B,C", 2, 3, u""},
      {"negative start", u"A,B,", -1, 1, u""},
      {"negative end", u"A,B,", 1, -1, u""},
      {"up to comma 0, which is met at the first character", u"A,B", 0, 0, u""},
      {"the same comma twice", u"A,B,", 1, 1, u"", 5},
      {"to comma 0, which lies before the first", u"A,B,", 1, 0, u"", 5},
  };
  for (const auto& row : rows) {
    Text result;
    EXPECT_EQ(error_of([&] { result = utils.GetData(row.list, row.start, row.end); }), row.error) << row.name;
    EXPECT_EQ(result, row.expected) << row.name;
  }
}

TEST_F(Lists, GetDataAsksMyPosForTheStartFirst) {
  (void)utils.GetData(u"A,B,", 1, 2);
  (void)utils.GetData(u"A,", 0, 1);
  (void)utils.GetData(u"A", 1, 2);  // The end is asked for even when there is no start.
  const std::vector<Text> calls = {u"MyPos|,|A,B,|1", u"MyPos|,|A,B,|2", u"MyPos|,|A,|1", u"MyPos|,|A|1",
                                   u"MyPos|,|A|2"};
  EXPECT_EQ(utils.calls, calls);
}

TEST_F(Lists, IndexInList) {
  const TextArray fruit = array_of({u"Apple", u"Ba", u"Banana", u"\u00C9clair"});
  const struct {
    const char* name;
    TextArray list;
    Text text;
    std::int32_t expected, error = 0;
  } rows[] = {
      {"start of an element, case aside, shorter ones skipped", fruit, u"ban", 2},
      {"accents have case too", fruit, u"\u00E9CL", 3},
      {"none", fruit, u"anana", -1},
      {"empty text", fruit, u"", 0},
      {"elements below 0 are not looked at", array_of({u"x", u"y"}, -1), u"", 0},
      {"all elements below 0", array_of({u"x"}, -1), u"x", -1},
      {"lower bound 1", array_of({u"Apple"}, 1), u"App", 0, 9},
      {"unallocated", {}, u"App", 0, 9},
  };
  for (const auto& row : rows) {
    std::int32_t index = 0;
    EXPECT_EQ(error_of([&] { index = utils.IndexInList(row.list, row.text); }), row.error) << row.name;
    EXPECT_EQ(index, row.expected) << row.name;
  }
}

TEST_F(Lists, MyPosAndSubStrCount) {
  const struct {
    const char* name;
    Text part, text;
    std::int32_t which, position, count;
  } rows[] = {
      {"second", u",", u"A,B,", 2, 4, 2},
      {"too few", u",", u"A,B,", 3, 0, 2},
      {"0 is met at the first character", u",", u"A,B", 0, 1, 1},
      {"0 is missed where that one matches", u",", u",B", 0, 0, 1},
      {"negative", u",", u"A,B", -1, 0, 1},
      {"two characters match nothing", u"AB", u"ABAB", 1, 0, 0},
      {"no characters match nothing, and 0 is met", u"", u"AB", 0, 1, 0},
      {"exact, not by code", u"'", u"\u2032'", 1, 2, 1},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(utils.MyPos(row.part, row.text, row.which), row.position) << row.name;
    EXPECT_EQ(utils.SubStrCount(row.part, row.text), row.count) << row.name;
  }
}

TEST_F(Lists, ReadCommaDelimStrToList) {
  const TextArray before = array_of({u"1", u"2", u"3", u"4"});
  const TextArray from_one = array_of({u"1"}, 1);
  const struct {
    const char* name;
    Text text;
    TextArray list;
    Text delimiter;
    std::int32_t expected;
    TextArray after;
    std::int32_t error = 0;
  } rows[] = {
      {"the rest is dropped, with the elements beyond", u"A,B,C", before, u",", 2, array_of({u"A", u"B"})},
      {"empty field", u"A,,B,", {}, u",", 3, array_of({u"A", u"", u"B"})},
      {"more than there were", u"a;b;c;d;e;", before, u";", 5, array_of({u"a", u"b", u"c", u"d", u"e"})},
      {"no delimiter in it", u"A;B", before, u",", 0, before},
      {"unallocated stays so", u"A;B", {}, u",", 0, {}},
      {"two characters are no delimiter", u"A,,B", before, u",,", 0, before},
      {"empty delimiter", u"A,B", before, u"", 0, before},
      {"exact, not by code", u"A\u2032B", before, u"'", 0, before},
      {"lower bound 1", u"A,", from_one, u",", -1, from_one, 9},
      {"lower bound 1 without a delimiter", u"A", from_one, u",", 0, from_one},
      {"lower bound below 0", u"A,", array_of({u"1"}, -1), u",", -1, array_of({u"1"}, -1), 9},
  };
  for (const auto& row : rows) {
    TextArray list = row.list;
    std::int32_t count = -1;
    EXPECT_EQ(error_of([&] { count = utils.ReadCommaDelimStrToList(row.text, list, row.delimiter); }), row.error)
        << row.name;
    EXPECT_EQ(count, row.expected) << row.name;
    EXPECT_EQ(list, row.after) << row.name;
  }
}

TEST_F(Lists, ReadCommaDelimStrToListTakesAnElementOfItsOwnArray) {
  TextArray list = array_of({u"A,B,", u"x"});
  EXPECT_EQ(utils.ReadCommaDelimStrToList(list.items[0], list, u","), 2);
  EXPECT_EQ(list, array_of({u"A", u"B"}));
}

TEST_F(Lists, StringPosition) {
  const struct {
    const char* name;
    Text text;
    std::int16_t option, expected;
  } rows[] = {
      {"number and street", u"12 SMITH ST", 1, 3},
      {"third blank, whose window is empty", u"UNIT 4 12 SMITH", 1, 10},
      {"a digit at the window's end", u"A SMI5TH", 1, 0},
      {"a digit just past the window", u"A SMIT5H", 1, 2},
      {"a digit by its substitute", u"A SMI\u2085TH", 1, 0},
      {"a digit at the window's start", u"A 5MITH", 1, 0},
      {"no blank", u"SMITH", 1, 0},
      {"other options", u"12 SMITH ST", 0, 0},
  };
  for (const auto& row : rows) EXPECT_EQ(utils.StringPosition(row.text, row.option), row.expected) << row.name;

  utils.calls.clear();
  EXPECT_EQ(utils.StringPosition(u"1 2 x y z", 1), 4);
  const std::vector<Text> calls = {u"SubStrCount| |1 2 X Y Z", u"MyPos| |1 2 X Y Z|1", u"MyPos| |1 2 X Y Z|2"};
  EXPECT_EQ(utils.calls, calls);

  EXPECT_EQ(utils.StringPosition(Text(32766, u'A') + u" ", 1), 32767);
  EXPECT_EQ(error_of([&] { (void)utils.StringPosition(Text(32767, u'A') + u" ", 1); }), 6);
}

TEST_F(Lists, MyInstrDelim) {
  const struct {
    const char* name;
    Text text, list, delimiter;
    bool expected;
  } rows[] = {
      {"closed field", u"B", u"A,B,", u",", true},
      {"the text after the last delimiter is none", u"B", u"A,B", u",", false},
      {"exact", u"b", u"A,B,", u",", false},
      {"part of a field", u"A", u"AB,", u",", false},
      {"empty field", u"", u",A,", u",", true},
      {"no empty field", u"", u"A,", u",", false},
      {"fields are cleared", u"AB", u"A,B,", u",", false},
      {"no delimiter", u"", u"A", u"", false},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(utils.MyInstrDelim(row.text, row.list, row.delimiter), Boolean(row.expected)) << row.name;
  }
}

}  // namespace
}  // namespace talutil::testing
