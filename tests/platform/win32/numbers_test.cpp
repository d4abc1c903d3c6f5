#include "automation/numbers.hpp"

#include <gtest/gtest.h>

#include <algorithm>
#include <charconv>
#include <cmath>
#include <regex>

#include "automation/checked.hpp"
#include "tests/platform/win32/oracle.hpp"

namespace talutil {
namespace {

/// Deliberate: what lies exactly between two texts goes to the even digit, the platform takes the larger one.
bool is_tie(double number, int digits) {
  char buffer[128];
  const auto end =
      std::to_chars(std::begin(buffer), std::end(buffer), std::abs(number), std::chars_format::scientific, 60);
  const std::string_view rest(buffer + digits + 1, end.ptr);
  return rest.starts_with('5') && rest.find_first_not_of("0e", 1) == rest.find('e') + 1;
}

TEST(PlatformNumbers, NumbersToText) {
  Generator generator;
  for (int i = 0; i < generated_count; ++i) {
    const double number = generator.number();
    const auto single = static_cast<float>(number);
    const CY currency{.int64 = static_cast<std::int64_t>(std::fmod(number, 9e18))};
    if (const std::string text = outcome([&] { return number_to_text(number); });
        !is_tie(number, 15) && !is_long_fraction(text)) {
      EXPECT_EQ(text,
                platform_outcome<BSTR>([&](BSTR* result) { return VarBstrFromR8(number, british_english, 0, result); }));
    }
    if (const std::string text = outcome([&] { return number_to_text(single); });
        !is_tie(single, 7) && !is_long_fraction(text)) {
      EXPECT_EQ(text,
                platform_outcome<BSTR>([&](BSTR* result) { return VarBstrFromR4(single, british_english, 0, result); }));
    }
    EXPECT_EQ(outcome([&] { return number_to_text(Currency{currency.int64}); }),
              platform_outcome<BSTR>([&](BSTR* text) { return VarBstrFromCy(currency, british_english, 0, text); }));
  }
}

TEST(PlatformNumbers, NumbersToNarrowerOnes) {
  Generator generator;
  const double edges[] = {32767.5, -32768.5, 32767.4999, -32768.50001, 2147483647.5, -2147483648.5, 2147483647.25};
  for (int i = 0; i < generated_count; ++i) {
    const double number = i < 7 ? edges[i] : generator.number();
    EXPECT_EQ(outcome([&] { return round_to<std::int16_t>(number); }),
              platform_outcome<SHORT>([&](SHORT* result) { return VarI2FromR8(number, result); }))
        << number;
    EXPECT_EQ(outcome([&] { return round_to<std::int32_t>(number); }),
              platform_outcome<LONG>([&](LONG* result) { return VarI4FromR8(number, result); }))
        << number;
    EXPECT_EQ(outcome([&] { return number_to_currency(number); }),
              platform_outcome<CY>([&](CY* result) { return VarCyFromR8(number, result); }))
        << number;
  }
}

/// What the platform takes for a number and we refuse, or the other way round, in UTF-8 ("\xC2\xA3" is a pound).
bool is_deliberate_difference(const std::string& text) {
  static const struct {
    const char* reason;
    std::regex pattern;
  } differences[] = {
      {"marks around &H and &O count as they do around digits", std::regex("&.*(-|\xC2\xA3)|[-(\xC2].*&")},
      {"no mark counts twice", std::regex("[+].*[+]|-.*-|\xC2.*\xC2")},
      {"a bracket that opens closes", std::regex("[(][^)]*$")},
      {"a thousands separator stands among digits", std::regex("[^0-9.,],|^,|[.],")},
      {"an exponent belongs to digits and has nothing but digits", std::regex("^[^0-9]*E|E.*,")},
      {"an amount of money may have an exponent", std::regex("\xC2.*E", std::regex::icase)},
  };
  return std::ranges::any_of(differences, [&](const auto& row) { return std::regex_search(text, row.pattern); });
}

Text number_like_text(Generator& generator) {
  constexpr TextView pieces[] = {u"1", u"25", u"0", u"007", u"9999", u".",  u",",  u"-",  u"+", u"\u00A3", u"(",   u")",
                                 u" ", u"\t", u"E", u"E-",  u"E+2",  u"&H", u"&O", u"FF", u"x", u".5",     u"12.5"};
  Text text;
  for (std::int32_t left = generator.whole(1, 6); left > 0; --left) text += generator.one_of(pieces);
  return text;
}

TEST(PlatformNumbers, TextToNumbers) {
  Generator generator;
  int accepted = 0;
  for (int i = 0; i < generated_count; ++i) {
    Text text = number_like_text(generator);
    const std::string shown = to_utf8(text);
    if (is_deliberate_difference(shown)) continue;
    const std::string number = outcome([&] { return text_to_number(text, british); });
    EXPECT_EQ(number,
              platform_outcome<double>([&](double* r) { return VarR8FromStr(raw(text), british_english, 0, r); }))
        << shown;
    if (number == "none" || number == "error 6") continue;
    ++accepted;

    // Deliberate: the platform makes 1 of some fractions, and no currency of hexadecimal numbers nor a right
    // one of more than four decimals.
    const double value = *text_to_number(text, british);
    if (std::abs(value) >= 1) {
      EXPECT_EQ(outcome([&] { return text_to_integer<std::int16_t>(text, british); }),
                platform_outcome<SHORT>([&](SHORT* r) { return VarI2FromStr(raw(text), british_english, 0, r); }))
          << shown;
      EXPECT_EQ(outcome([&] { return text_to_integer<std::int32_t>(text, british); }),
                platform_outcome<LONG>([&](LONG* r) { return VarI4FromStr(raw(text), british_english, 0, r); }))
          << shown;
    }
    if (value * 10000 == std::floor(value * 10000) && text.find(u'&') == Text::npos) {
      EXPECT_EQ(outcome([&] { return text_to_currency(text, british); }),
                platform_outcome<CY>([&](CY* r) { return VarCyFromStr(raw(text), british_english, 0, r); }))
          << shown;
    }
  }
  EXPECT_GT(accepted, generated_count / 10);
}

TEST(PlatformNumbers, NumbersSurviveTheirTexts) {
  Generator generator;
  for (int i = 0; i < generated_count; ++i) {
    Text text = number_to_text(generator.number());
    double expected = 0;
    ASSERT_EQ(VarR8FromStr(raw(text), british_english, 0, &expected), S_OK) << to_utf8(text);
    const double number = text_to_number(text).value();
    // The platform's reading is a few units off in the last place.
    EXPECT_NEAR(number, expected, std::abs(number) * 1e-15) << to_utf8(text);
  }
}

TEST(PlatformNumbers, TextToBoolean) {
  const TextView texts[] = {u"True", u"tRUE",  u"FALSE", u" True", u"#TRUE#", u"#true#", u"#FALSE#", u"1",
                            u"0",    u"-0.01", u"yes",   u"",      u"True ",  u" 5 ",    u"1E400",   u"&H0"};
  for (const TextView row : texts) {
    Text text(row);
    EXPECT_EQ(outcome([&] { return Variant(text).to_boolean(british); }),
              platform_outcome<Boolean>(
                  [&](Boolean* result) {
                    VARIANT_BOOL bits = 0;
                    const HRESULT status = VarBoolFromStr(raw(text), british_english, 0, &bits);
                    *result = Boolean::from_bits(bits);
                    return status;
                  },
                  "error 13"))
        << to_utf8(text);
  }
}

}  // namespace
}  // namespace talutil
