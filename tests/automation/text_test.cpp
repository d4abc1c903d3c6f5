#include "automation/text.hpp"

#include <gtest/gtest.h>

#include "tests/automation/outcome.hpp"

namespace talutil {
namespace {

TEST(Text, TrimsBlanksOnly) {
  const struct {
    const char* name;
    TextView text;
    TextView expected;
  } rows[] = {
      {"both ends", u"  a b ", u"a b"},
      {"nothing but blanks", u"   ", u""},
      {"empty", u"", u""},
      {"tabs, breaks and no-break blanks stay", u" \t a\r\n\u00A0 ", u"\t a\r\n\u00A0"},
  };
  for (const auto& row : rows) EXPECT_EQ(trim_blanks(row.text), row.expected) << row.name;
}

TEST(Text, CodesAreThoseOfCodePage1252) {
  const struct {
    const char* name;
    char16_t unit;
    int expected;
  } rows[] = {
      {"ASCII", u'~', '~'},
      {"Latin-1", u'\u00E9', 0xE9},
      {"held by the code page", u'\u20AC', 0x80},
      {"an open byte is itself", 0x81, 0x81},
      {"a control that is no byte of the page", 0x80, '?'},
      {"best fit drops the accent", u'\u0100', 'A'},
      {"best fit, last of the list", u'\u03B2', 0xDF},
      {"full width, first and last", u'\uFF01', '!'},
      {"full width, last", u'\uFF5E', '~'},
      {"behind full width", u'\uFF5F', '?'},
      {"no substitute", u'\u4E00', '?'},
      {"lone surrogate", 0xD800, '?'},
      {"end of the plane", 0xFFFF, '?'},
  };
  for (const auto& row : rows) EXPECT_EQ(ansi_code(row.unit), row.expected) << row.name;
}

TEST(Text, EveryByteComesBackThroughItsCharacter) {
  for (int code = 0; code < 256; ++code) EXPECT_EQ(ansi_code(chr(code).front()), code);
  EXPECT_EQ(outcome([] { return chr(256); }), "error 5");
  EXPECT_EQ(outcome([] { return chr(-1); }), "error 5");
}

TEST(Text, AnsiBytes) {
  EXPECT_EQ(to_ansi(u"O\u2019Neil \u0141\u4E00"), "O\x92Neil L?");
  EXPECT_EQ(from_ansi("O\x92Neil \x9F"), u"O\u2019Neil \u0178");
}

TEST(Text, LetterCase) {
  const struct {
    const char* name;
    TextView lower;
    TextView upper;
  } pairs[] = {
      {"ASCII", u"o'neil [z]", u"O'NEIL [Z]"},
      {"Latin-1 but not the division sign", u"\u00E0\u00F6\u00F8\u00FE", u"\u00C0\u00D6\u00D8\u00DE"},
      {"partner beyond Latin-1", u"\u00FF", u"\u0178"},
      {"alternating runs", u"\u0101\u012F\u017E", u"\u0100\u012E\u017D"},
      {"Greek, Cyrillic", u"\u03B1\u03C9\u0430\u045F", u"\u0391\u03A9\u0410\u040F"},
      {"far partners", u"\u0250\u1D79\uABBF", u"\u2C6F\uA77D\u13EF"},
      {"full width", u"\uFF41\uFF5A", u"\uFF21\uFF3A"},
  };
  for (const auto& pair : pairs) {
    EXPECT_EQ(upper_case(pair.lower), pair.upper) << pair.name;
    EXPECT_EQ(lower_case(pair.upper), pair.lower) << pair.name;
    EXPECT_EQ(upper_case(pair.upper), pair.upper) << pair.name;
    EXPECT_EQ(lower_case(pair.lower), pair.lower) << pair.name;
    EXPECT_TRUE(equals_without_case(pair.lower, pair.upper)) << pair.name;
  }
  constexpr TextView without_case = u"\u00DF\u00F7\u00D7\u0131\u01C5\u03C2@`{";
  EXPECT_EQ(upper_case(without_case), without_case);
  EXPECT_EQ(lower_case(without_case), without_case);
  EXPECT_FALSE(equals_without_case(u"abc", u"ab"));
}

TEST(Text, Utf8) {
  const struct {
    const char* name;
    TextView text;
    std::string_view bytes;
  } both_ways[] = {
      {"one to three bytes", u"a\u007F\u0080\u07FF\u0800\uFFFF", "a\x7F\xC2\x80\xDF\xBF\xE0\xA0\x80\xEF\xBF\xBF"},
      {"four bytes", u"\U00010000\U0010FFFF", "\xF0\x90\x80\x80\xF4\x8F\xBF\xBF"},
  };
  for (const auto& row : both_ways) {
    EXPECT_EQ(to_utf8(row.text), row.bytes) << row.name;
    EXPECT_EQ(from_utf8(row.bytes), row.text) << row.name;
  }
  const struct {
    const char* name;
    std::string_view bytes;
    TextView expected;
  } bad[] = {
      {"continuation alone", "\x80z", u"\uFFFDz"},
      {"overlong", "\xC0\x80", u"\uFFFD\uFFFD"},
      {"overlong, three bytes", "\xE0\x80\x80", u"\uFFFD\uFFFD\uFFFD"},
      {"surrogate", "\xED\xA0\x80", u"\uFFFD\uFFFD\uFFFD"},
      {"beyond the last plane", "\xF4\x90\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},
      {"cut short", "a\xE2\x82", u"a\uFFFD\uFFFD"},
      {"interrupted", "\xE2\x82z", u"\uFFFD\uFFFDz"},
  };
  for (const auto& row : bad) EXPECT_EQ(from_utf8(row.bytes), row.expected) << row.name;
  const char16_t lone[] = {0xDC00, 0xD800, u'z', 0xD800};
  EXPECT_EQ(to_utf8(TextView(lone, 4)), "\xEF\xBF\xBD\xEF\xBF\xBDz\xEF\xBF\xBD");
}

}  // namespace
}  // namespace talutil
