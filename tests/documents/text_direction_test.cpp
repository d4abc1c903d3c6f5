#include "documents/text_direction.hpp"

#include <gtest/gtest.h>

#include "documents/arabic_joining.hpp"
#include "tests/fakes/rows.hpp"

namespace talutil {

namespace {

/// A line as it is drawn from left to right.
Text drawn(TextView line) {
  Text result;
  for (const DirectedText& part : in_visual_order(joined(line), is_right_to_left(line))) {
    result += part.is_right_to_left ? drawn_from_left(part.text) : part.text;
  }
  return result;
}

}  // namespace

// The official data test the algorithm where they are installed; these are what a report shows.
TEST(TextDirection, LinesAreDrawnAsTheyAreSeen) {
  const testing::Rows<Text, Text> rows = {
      {"Hebrew is reversed", u"\u05D0\u05D1\u05D2", u"\u05D2\u05D1\u05D0"},
      {"parentheses are mirrored", u"\u05D0 (\u05D1)", u"(\u05D1) \u05D0"},
      {"a mark is drawn before its letter", u"\u05D0\u05B8\u05D1", u"\u05D1\u05B8\u05D0"},
      {"Arabic digits", u"\u0628 \u0661\u0662", u"\u0661\u0662 \uFE8F"},
      {"marks of direction have no shape", u"a\u200F!\u200E b", u"a! b"},
      {"an isolate keeps to itself", u"a \u2067\u05D0 1\u2069 2", u"a 1 \u05D0 2"},
      {"a pair of surrogates stays one character", u"\u05D0\xD83D\xDE00\u05D1", u"\u05D1\xD83D\xDE00\u05D0"},
      {"letters beyond the basic plane", u"\xD802\xDC00\xD802\xDC01", u"\xD802\xDC01\xD802\xDC00"},
      {"half a pair is a character", u"\u05D0\xDE00", u"\xDE00\u05D0"},
  };
  testing::check_rows(
      rows, [](const Text& line, const Text& expected) { EXPECT_EQ(to_utf8(drawn(line)), to_utf8(expected)); });
}

TEST(TextDirection, ArabicLettersJoin) {
  const testing::Rows<Text, Text> rows = {
      {"initial, medial, final", u"\u0628\u0628\u0628", u"\uFE91\uFE92\uFE90"},
      {"what joins only the letter before it", u"\u0628\u0627\u0628", u"\uFE91\uFE8E\uFE8F"},
      {"a mark between does not separate", u"\u0628\u064E\u0628", u"\uFE91\u064E\uFE90"},
      {"a non-joiner does", u"\u0628\u200C\u0628", u"\uFE8F\u200C\uFE8F"},
      {"lam with alef", u"\u0644\u0627", u"\uFEFB"},
      {"lam with alef behind a letter", u"\u0628\u0644\u0623\u0628", u"\uFE91\uFEF8\uFE8F"},
      {"marks in a ligature stay in order", u"\u0644\u064E\u0627\u064B", u"\uFEFB\u064E\u064B"},
      {"Persian letters", u"\u067E\u0686", u"\uFB58\uFB7B"},
      {"a lengthened letter", u"\u0628\u0640", u"\uFE91\u0640"},
  };
  testing::check_rows(
      rows, [](const Text& letters, const Text& expected) { EXPECT_EQ(to_utf8(joined(letters)), to_utf8(expected)); });
  EXPECT_EQ(letter_of_form(0xFE92), 0x0628);
  EXPECT_EQ(letter_of_form(0xFEFB), 0xFEFB) << "a ligature";
}

}  // namespace talutil
