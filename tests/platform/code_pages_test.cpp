// Code pages as both platforms have them, and the members that compare characters by them.
#include <gtest/gtest.h>

#include "tests/fakes/utils_test.hpp"
#include "tests/platform/real_platform.hpp"

namespace talutil::testing {
namespace {

/// A toolkit on a fake platform that has one of the real code pages.
struct Toolkit {
  explicit Toolkit(std::uint32_t number)
      : library((platform.used_code_page = real_code_page(number), platform.platform())) {}

  FakePlatform platform;
  Library library;
  ORVUtils utils{library};
};

TEST(CodePages, BytesAndTexts) {
  const Rows<std::uint32_t, TextView, std::string_view> both_ways = {
      {"Western", 1252, u"O\u2019Neil \u20AC", "O\x92Neil \x80"},
      {"Cyrillic", 1251, u"\u041E\u043B\u044C\u0433\u0430 \u21165", "\xCE\xEB\xFC\xE3\xE0 \xB9\x35"},
      {"Greek", 1253, u"\u038F\u03C1\u03B1", "\xBF\xF1\xE1"},
      {"a mark stays apart from its letter", 1258, u"\u00EA\u0301", "\xEA\xEC"},
      {"one and two bytes", 932, u"A\u6771\u4EACz", "A\x93\x8C\x8B\x9Ez"},
      {"a pair of units", 65001, u"\u0416\U0001F600", "\xD0\x96\xF0\x9F\x98\x80"},
      {"nothing", 932, u"", ""},
  };
  check_rows(both_ways, [](std::uint32_t number, TextView text, std::string_view bytes) {
    EXPECT_EQ(real_code_page(number)->bytes_of(text), bytes);
    EXPECT_EQ(real_code_page(number)->text_of(bytes), text);
  });
  const char16_t lone[] = {0xD800, u'a'};
  EXPECT_EQ(real_code_page(1251)->bytes_of(u"\u6771a\U0001F600"), "?a??");
  EXPECT_EQ(real_code_page(65001)->bytes_of(TextView(lone, 2)), "\xEF\xBF\xBD\x61");
  EXPECT_EQ(real_code_page(65001)->text_of("\xFF\x61"), u"\uFFFDa");
}

TEST(CodePages, MembersKeepTheLettersOfThePage) {
  const auto verified = [](ORVUtils& utils, const Text& text) { return utils.VerifyTextData(0, 0, text); };
  const auto digits = [](ORVUtils& utils, const Text& text) {
    Text character;
    return utils.RemoveStringsFromNumber(0, text, character);
  };
  const Rows<std::uint32_t, Text (*)(ORVUtils & utils, const Text& text), Text, Text> rows = {
      // The acute accent in the place of the quote is not in the page, and goes with the question mark.
      {"Cyrillic", 1251, verified, u"\u041E\u043B\u044C\u0433\u0430 \u041E'\u041D\u0438\u043B?",
       u"\u041E\u043B\u044C\u0433\u0430 \u041E\u041D\u0438\u043B"},
      {"beyond the page", 932, verified, u"\u6771\u0E01\uFF1F?'", u"\u6771\uFF1F\u00B4"},
      {"all but the question mark", 65001, verified, u"\u0416\u6771\u0E01\U0001F600?", u"\u0416\u6771\u0E01\U0001F600"},
      {"a digit of two bytes is none", 932, digits, u"\uFF155", u"5"},
  };
  check_rows(rows, [](std::uint32_t page, auto* call, const Text& text, const Text& expected) {
    Toolkit toolkit(page);
    EXPECT_EQ(call(toolkit.utils, text), expected);
  });
}

// Long texts are passed over in blocks, short ones are not; both must agree with the page on every unit.
TEST(CodePages, StringReplaceAgreesWithThePageOnEveryCharacter) {
  Text every;
  for (std::uint32_t unit = 0; unit <= 0xFFFF; ++unit) every += static_cast<char16_t>(unit);
  for (const std::uint32_t number : {1252, 1251, 932, 65001}) {
    Toolkit toolkit(number);
    std::vector<std::string> bytes;
    CodePage& page = *toolkit.platform.used_code_page;
    for (const char16_t unit : every) {
      std::uint32_t code = 0;
      for (const char byte : bytes.emplace_back(page.bytes_of(TextView(&unit, 1)))) {
        code = code * 256 + static_cast<unsigned char>(byte);
      }
      EXPECT_EQ(page.code(unit), code) << number << " " << int{unit};
    }
    EXPECT_EQ(page.latin_count(), number == 1252 ? 0x60 : number == 1251 ? 1 : 0);
    for (const char16_t wanted : Text(u"?& \0A\x0081\u20AC\u00E9\u0416\u6771\xD800", 11)) {
      Text expected;
      for (const char16_t unit : every) {
        if (bytes[unit] != bytes[wanted]) expected += unit;
      }
      EXPECT_EQ(toolkit.utils.StringReplace(every, Text(1, wanted), u""), expected) << number << " " << int{wanted};
      Text by_pieces;
      for (std::size_t at = 0; at < every.size(); at += 100) {
        by_pieces += toolkit.utils.StringReplace(every.substr(at, 100), Text(1, wanted), u"");
      }
      EXPECT_EQ(by_pieces, expected) << number << " " << int{wanted};
    }
  }
}

// An object whose members may be overridden calls them one after the other; others clean a text in one pass.
TEST(CodePages, OnePassCleansAsTheCallsOfMembers) {
  Text text;
  for (std::uint32_t unit = 1; unit <= 0xFFFF; ++unit) {
    text += static_cast<char16_t>(unit);
    if (unit % 500 == 0) text += u" '&'\u00B4,'\" ?";
  }
  for (const std::uint32_t number : {1252, 1251, 932, 65001}) {
    Toolkit toolkit(number);
    RecordingUtils by_calls(toolkit.library);
    for (std::int16_t extras = 0; extras <= 3; ++extras) {
      EXPECT_EQ(toolkit.utils.VerifyTextData(0, extras, text), by_calls.VerifyTextData(0, extras, text))
          << number << " " << extras;
    }
  }
}

}  // namespace
}  // namespace talutil::testing
