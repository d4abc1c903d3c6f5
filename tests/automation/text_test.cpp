#include "automation/text.hpp"

#include <gtest/gtest.h>

#include "tests/fakes/error_of.hpp"
#include "tests/fakes/rows.hpp"

namespace talutil {
namespace {

using testing::outcome;

TEST(Text, TrimsBlanksOnly) {
  EXPECT_EQ(trim_blanks(u"   "), u"");
  EXPECT_EQ(trim_blanks(u" \t a\r\n\u00A0 "), u"\t a\r\n\u00A0") << "tabs, breaks and no-break blanks stay";
}

TEST(Text, AnsiBytes) {
  for (int code = 0; code < 256; ++code) EXPECT_EQ(ansi_code(chr(code).front()), code);
  for (const int code : {-1, 256}) EXPECT_EQ(outcome([&] { return chr(code); }), "error 5") << code;
  EXPECT_EQ(to_ansi(u"O\u2019Neil \u0141\u4E00"), "O\x92Neil L?");
}

// All letters are compared with the platform's.
TEST(Text, LetterCase) {
  constexpr TextView lower = u"o'neil [z]\u00E0\u00FF\u0101\uABBF";
  EXPECT_EQ(upper_case(lower), u"O'NEIL [Z]\u00C0\u0178\u0100\u13EF");
  EXPECT_TRUE(equals_without_case(lower, upper_case(lower)));
  EXPECT_FALSE(equals_without_case(u"abc", u"ab"));
}

TEST(Text, Utf8) {
  // The first and the last character of each length.
  constexpr TextView text = u"a\u007F\u0080\u07FF\u0800\uFFFF\U00010000\U0010FFFF";
  constexpr auto bytes = "a\x7F\xC2\x80\xDF\xBF\xE0\xA0\x80\xEF\xBF\xBF\xF0\x90\x80\x80\xF4\x8F\xBF\xBF";
  EXPECT_EQ(to_utf8(text), bytes);
  EXPECT_EQ(from_utf8(bytes), text);
  const testing::Rows<std::string_view, TextView> bad = {
      {"continuation alone", "\x80z", u"\uFFFDz"},
      {"overlong", "\xC0\x80", u"\uFFFD\uFFFD"},
      {"overlong, three bytes", "\xE0\x80\x80", u"\uFFFD\uFFFD\uFFFD"},
      {"surrogate", "\xED\xA0\x80", u"\uFFFD\uFFFD\uFFFD"},
      {"beyond the last plane", "\xF4\x90\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},
      {"cut short", "a\xE2\x82", u"a\uFFFD\uFFFD"},
      {"interrupted", "\xE2\x82z", u"\uFFFD\uFFFDz"},
  };
  testing::check_rows(bad, [](std::string_view given, TextView read) { EXPECT_EQ(from_utf8(given), read); });
  const char16_t lone[] = {0xDC00, 0xD800, u'z', 0xD800};
  EXPECT_EQ(to_utf8(TextView(lone, 4)), "\xEF\xBF\xBD\xEF\xBF\xBDz\xEF\xBF\xBD");
}

}  // namespace
}  // namespace talutil
