#include <gtest/gtest.h>

#include "archives/entry_names.hpp"
#include "archives/item_list.hpp"

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
  const struct {
    TextView list;
    TextView entry;
    bool matches;
  } rows[] = {
      {u"", u"a/b.txt", true},           {u"*.*", u"a/b.txt", true},         {u"*.TXT", u"a/b.txt", true},
      {u"b.txt", u"a/b.txt", true},      {u"a", u"a/b.txt", true},           {u"a\\*.txt", u"a/b.txt", true},
      {u"a/*.txt", u"x/a/b.txt", false}, {u"c.txt", u"a/b.txt", false},      {u"a/b.txt/c", u"a/b.txt", false},
      {u"x *.txt", u"a/b.txt", true},    {u"\"my file\"", u"my file", true},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(EntryFilter(row.list).matches(parts_of(row.entry)), row.matches)
        << to_utf8(row.list) << " " << to_utf8(row.entry);
  }
}

TEST(EntryNames, StayBelowTheFolder) {
  const struct {
    Text name;
    Text parts;  // "-" is refused.
  } rows[] = {{u"a/b.txt", u"a|b.txt"},
              {u"a\\b.txt", u"a|b.txt"},
              {u"/etc/passwd", u"etc|passwd"},
              {u"C:\\Windows\\x.dll", u"Windows|x.dll"},
              {u"\\\\server\\share\\x", u"server|share|x"},
              {u"./a//b/", u"a|b"},
              {u"../a", u"-"},
              {u"a/..\\b", u"-"},
              {u"", u"-"},
              {u"C:", u"-"},
              {Text(u"a\0b", 3), u"-"},
              {u"con", u"_con"},
              {u"a/NUL.txt", u"a|_NUL.txt"},
              {u"com1", u"_com1"},
              {u"com10", u"com10"},
              {u"x/a:b?<>|*\".txt", u"x|a_b______.txt"},
              {u"x\t\u0001y", u"x__y"},
              {u"trailing. .", u"trailing___"},
              {u"...", u"___"},
              {Text(255, u'x'), Text(255, u'x')},
              {Text(256, u'x'), u"-"},
              {Text(65535, u'y'), u"-"}};
  for (const auto& row : rows) {
    const auto parts = safe_parts(row.name);
    EXPECT_EQ(parts ? joined(*parts) : u"-", row.parts) << to_utf8(row.name.substr(0, 40));
  }
}

}  // namespace
}  // namespace talutil::archives
