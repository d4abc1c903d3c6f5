#include "platform/profile_document.hpp"

#include "tests/fakes/rows.hpp"

namespace talutil {
namespace {

using testing::check_rows;

// How lines of all kinds are read is compared with the platform in settings_test.cpp.
TEST(ProfileDocument, Reads) {
  const testing::Rows<std::string_view, Text, Text, Text> rows = {
      {"a NUL ends a value", std::string_view("[a]\nx=1\0y\nz=2", 13), u"a", u"x", u"1"},
      {"UTF-8 with its mark", "\xEF\xBB\xBF[a]\nx=\xC5\x82", u"a", u"x", u"\u0142"},
      {"UTF-16 with its mark", std::string_view("\xFF\xFE[\0a\0]\0\n\0x\0=\0B\x01", 16), u"a", u"x", u"\u0142"},
  };
  check_rows(rows, [](std::string_view text, const Text& section, const Text& item, const Text& value) {
    EXPECT_EQ(ProfileDocument(text).value(section, item), value);
  });
  const ProfileDocument document("t=0\n[b]\nx=1\n;c=2\ny\nz=\n=5\n[]\n[b]\n");
  using Entry = ProfileDocument::Entry;
  EXPECT_EQ(document.entries(),
            (std::vector<Entry>{{u"", u"t", u"0"}, {u"b", u"x", u"1"}, {u"b", u"z", u""}, {u"b", u"", u"5"}}));
}

TEST(ProfileDocument, ChangesOneLine) {
  const testing::Rows<std::string_view, Text, Text, Text, std::string_view> rows = {
      {"in place, spelling and blanks kept", "; head\r\n[A]\r\n\r\nx = 1 ; c\r\ny=2", u"a", u"X", u"9",
       "; head\r\n[A]\r\n\r\nx = 9\r\ny=2"},
      {"after the last line of the section", "[a]\nx=1\n\n\n[b]\n", u"a", u"y", u" v ", "[a]\nx=1\r\ny=v \n\n\n[b]\n"},
      {"a new section", "[a]\nx=1", u" b ", u" y ", u"2", "[a]\nx=1\r\n[b]\r\ny=2\r\n"},
      {"before all sections", "[a]\n", u"", u"x", u"1", "x=1\r\n[a]\n"},
      {"UTF-8 stays", "\xEF\xBB\xBF[a]\nx=1", u"a", u"x", u"\u0142", "\xEF\xBB\xBF[a]\nx=\xC5\x82"},
  };
  check_rows(rows, [](auto before, const Text& section, const Text& item, const Text& value, auto after) {
    ProfileDocument document(before);
    document.put(section, item, value);
    EXPECT_EQ(document.bytes(), after);
  });
}

}  // namespace
}  // namespace talutil
