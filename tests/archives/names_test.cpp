#include <gtest/gtest.h>

#include "archives/entry_names.hpp"
#include "archives/item_list.hpp"
#include "tests/fakes/rows.hpp"

namespace talutil::archives {
namespace {

Text joined(const std::vector<Text>& parts) {
  Text all;
  for (const Text& part : parts) all += (all.empty() ? u"" : u"|") + part;
  return all;
}

TEST(ItemList, IsReadByBlanksAndQuotes) {
  const auto read = [](TextView list) { return joined(read_item_list(list)); };
  EXPECT_EQ(read(u" \t\r\n"), u"");
  EXPECT_EQ(read(u" a.txt  b.txt\tC:\\*.dat "), u"a.txt|b.txt|C:\\*.dat");
  EXPECT_EQ(read(u"\"C:\\My Data\\*.*\" x"), u"C:\\My Data\\*.*|x");
  EXPECT_EQ(read(u"C:\\\"My Data\"\\a"), u"C:\\My Data\\a") << "quoted in part";
  EXPECT_EQ(read(u"\"a b"), u"a b") << "a quote left open";
}

TEST(EntryFilter, ComparesPartsFromTheFrontOrTheLast) {
  const auto matches = [](TextView list, TextView entry) { return EntryFilter(list).matches(parts_of(entry)); };
  for (const TextView list : {u"", u"*.*", u"*.TXT", u"b.txt", u"a", u"a\\*.txt", u"x *.txt"}) {
    EXPECT_TRUE(matches(list, u"a/b.txt")) << to_utf8(list);
  }
  for (const TextView list : {u"c.txt", u"a/b.txt/c"}) EXPECT_FALSE(matches(list, u"a/b.txt")) << to_utf8(list);
  EXPECT_FALSE(matches(u"a/*.txt", u"x/a/b.txt"));
  EXPECT_TRUE(matches(u"\"my file\"", u"my file"));
}

TEST(EntryNames, StayBelowTheFolder) {
  const struct {
    Text name;
    Text parts;
  } rows[] = {
      {u"a/b.txt", u"a|b.txt"},
      {u"a\\b.txt", u"a|b.txt"},
      {u"\\\\server\\share\\x", u"server|share|x"},
      {u"./a//b/", u"a|b"},
      {u"con", u"_con"},
      {u"a/NUL.txt", u"a|_NUL.txt"},
      {u"com1", u"_com1"},
      {u"com10", u"com10"},
      {u"x/a:b?<>|*\".txt", u"x|a_b______.txt"},
      {u"x\t\u0001y", u"x__y"},
      {u"trailing. .", u"trailing___"},
      {u"...", u"___"},
      {Text(255, u'x'), Text(255, u'x')},
  };
  for (const auto& row : rows) EXPECT_EQ(joined(safe_parts(row.name).value()), row.parts) << to_utf8(row.name);
  for (const Text& refused :
       {Text(u"../a"), Text(u"a/..\\b"), Text(), Text(u"C:"), Text(u"a\0b", 3), Text(256, u'x')}) {
    EXPECT_FALSE(safe_parts(refused)) << to_utf8(refused);
  }
}

TEST(EntryNames, OfTheirOwnStayBelowTheFolderToo) {
  const testing::Rows<Text, Text> rows = {
      {"names that only Windows does not allow", u"a/aux.c/x:?. ", u"a|aux.c|x:?. "},
      {"a backslash is a character", u"a\\..\\b", u"a\\..\\b"},
      {"a drive is a name", u"C:/x", u"C:|x"},
      {"control characters", u"a\nb", u"a\nb"},
      {"from the root", u"/etc/passwd", u"etc|passwd"},
      {"dots without a meaning", u"./a/.//b/", u"a|b"},
      {"three dots are a name", u"...", u"..."},
  };
  testing::check_rows(rows,
                      [](const Text& name, const Text& parts) { EXPECT_EQ(joined(own_parts(name).value()), parts); });
  for (const Text& refused :
       {Text(u"../a"), Text(u"a/../b"), Text(u".."), Text(u"/"), Text(u"a\0b", 3), Text(256, u'x')}) {
    EXPECT_FALSE(own_parts(refused)) << to_utf8(refused);
  }
}

}  // namespace
}  // namespace talutil::archives
