#include "automation/numbers.hpp"

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <limits>

#include "automation/checked.hpp"
#include "automation/decimal_digits.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/fakes/rows.hpp"

namespace talutil {
namespace {

using testing::check_rows;
using testing::outcome;

constexpr Locale comma_locale{.decimal_separator = u',', .thousands_separator = u'.', .currency_symbol = {u'\u20AC'}};

// Without blanks, other bases and separators a number is what the C library takes for one.
TEST(Numbers, AreReadAsTheCLibraryReadsThem) {
  constexpr TextView pieces[] = {u"0", u"1", u"25", u"007", u"9999", u".", u"-", u"+", u"e", u"E+", u"e-", u"y"};
  testing::Generator generator;
  for (int i = 0; i < 20'000; ++i) {
    Text text;
    for (int left = generator.whole(0, 7); left > 0; --left) text += generator.one_of(pieces);
    const std::string bytes = to_utf8(text);
    char* end = nullptr;
    const double number = std::strtod(bytes.c_str(), &end);
    const std::string expected = std::isfinite(number) ? outcome([&] { return number; }) : "error 6";
    EXPECT_EQ(outcome([&] { return leading_number(text); }), expected) << bytes;
    // Whole texts may have one sign of each kind, behind the number too.
    if (text.find(u"+-") != Text::npos || text.find(u"-+") != Text::npos || text.find_last_of(u"+-") + 1 == text.size())
      continue;
    const bool is_whole = !bytes.empty() && *end == 0;
    EXPECT_EQ(outcome([&] { return text_to_number(text); }), is_whole ? expected : "none") << bytes;
  }
}

// Numbers of every size, near powers of ten and half-way between two, have the digits that the C library writes.
TEST(Numbers, AreRoundedAsTheCLibraryRoundsThem) {
  testing::Generator generator;
  for (int i = 0; i < 50'000; ++i) {
    const std::int64_t whole = generator.whole(1, 99'999'999);
    const double numbers[] = {std::ldexp(static_cast<double>(whole), static_cast<int>(generator.whole(-1070, 990))),
                              static_cast<double>(whole) / 1000, static_cast<double>(whole) / 4096,
                              std::nextafter(std::pow(10.0, static_cast<double>(generator.whole(-14, 17))), i % 2)};
    const double number = generator.one_of(numbers);
    const int count = i % 3 == 0 ? 15 : static_cast<int>(generator.whole(1, 17));
    std::array<char, 40> expected{};
    std::snprintf(expected.data(), expected.size(), "%.*e", count - 1, number);
    const DecimalDigits digits = decimal_digits(number, count);
    std::string written = digits.digits + std::string(static_cast<std::size_t>(count) - digits.digits.size(), '0');
    if (count > 1) written.insert(1, ".");
    std::array<char, 40> got{};
    std::snprintf(got.data(), got.size(), "%se%+03d", written.c_str(), digits.exponent);
    EXPECT_STREQ(got.data(), expected.data());
  }
}

// The nearest whole number to a quotient, the even one of two.
std::int64_t rounded(std::int64_t number, std::int64_t divisor) {
  const std::int64_t rest = ((number % divisor) + divisor) % divisor;
  const std::int64_t below = (number - rest) / divisor;
  return rest * 2 > divisor || (rest * 2 == divisor && below % 2 != 0) ? below + 1 : below;
}

TEST(Numbers, TextsAreRoundedExactly) {
  constexpr std::int64_t powers[] = {1, 10, 100, 1000, 10'000, 100'000, 1'000'000};
  constexpr std::int64_t edges[] = {0, 0, 32767, -32768, 2147483647, -2147483648};
  testing::Generator generator;
  for (int i = 0; i < 20'000; ++i) {
    // Around halves of whole numbers and of ten-thousandths, at the ends of types and elsewhere.
    const std::size_t places = static_cast<std::size_t>(generator.whole(1, 6));
    const std::int64_t scale = powers[places];
    const std::int64_t halves[] = {0, scale / 2, places > 4 ? powers[places - 4] / 2 : 0, generator.whole(0, 999'999)};
    const std::int64_t number = (generator.one_of(edges) + generator.whole(-3, 3)) * scale + generator.one_of(halves) +
                                generator.whole(-1, 1) + (i % 2) * generator.whole(-1000, 1000) * powers[5];
    const std::string digits = std::to_string(std::abs(number) % scale + scale).substr(1);
    const Text text = from_utf8((number < 0 ? "-" : "") + std::to_string(std::abs(number) / scale) + "." + digits);
    const std::int64_t whole = rounded(number, scale);
    EXPECT_EQ(outcome([&] { return text_to_integer<std::int16_t>(text); }),
              outcome([&] { return checked_cast<std::int16_t>(whole); }))
        << to_utf8(text);
    EXPECT_EQ(outcome([&] { return text_to_integer<std::int32_t>(text); }),
              outcome([&] { return checked_cast<std::int32_t>(whole); }))
        << to_utf8(text);
    const std::int64_t money = places > 4 ? rounded(number, powers[places - 4]) : number * powers[4 - places];
    EXPECT_EQ(text_to_currency(text), Currency{money}) << to_utf8(text);
  }
}

TEST(Numbers, LeadingNumber) {
  const testing::Rows<TextView, std::string> rows = {
      {"stops at a comma", u"1,000", "1"},
      {"skips every kind of blank", u"\t-\r1\n2\u3000. 5 e \u30001", "-125"},
      {"stops at a no-break blank", u"1\u00A02", "1"},
      {"exponent after D", u"25D-1", "2.5"},
      {"hexadecimal of 16 bits is signed", u"&HFFFF", "-1"},
      {"leading zeros do not widen it", u"&h0007fffx", "32767"},
      {"with a mark behind it is not", u"&HFFFF&", "65535"},
      {"32 bits are signed", u"& H F FFFF FFF", "-1"},
      {"17 bits", u"&H10000", "65536"},
      {"more bits are not", u"&H100000000", "4294967296"},
      {"octal stops at 8", u"&O178", "15"},
      {"no bits", u"&HG", "0"},
      {"just too large", u"1.7976931348623159e308", "error 6"},
  };
  check_rows(rows, [](TextView text, const std::string& number) {
    EXPECT_EQ(outcome([&] { return leading_number(text); }), number);
  });
}

TEST(Numbers, LongTextsTakeLinearTime) {
  constexpr std::size_t length = 2U << 20;  // Quadratic work would not end.
  EXPECT_EQ(leading_number(Text(length, u' ') + u"7" + Text(length, u' ')), 7);
  EXPECT_EQ(leading_number(u"." + Text(length, u'0') + u"1e" + Text(length, u'0')), 0);
  EXPECT_EQ(text_to_number(Text(length, u' ') + u"7" + Text(length, u' ')), 7);
  EXPECT_EQ(upper_case(from_ansi(to_ansi(Text(length, u'\u00E9')))).back(), u'\u00C9');
}

TEST(Numbers, ToText) {
  EXPECT_EQ(number_to_text(0.012345678901234), u"0.012345678901234") << "as many decimal places as digits";
  EXPECT_EQ(number_to_text(-3.5 / 42), u"-8.33333333333333E-02") << "one more";
  EXPECT_EQ(number_to_text(-3.5F / 42), u"-8.333334E-02");
  EXPECT_EQ(number_to_text(-1.5e300, comma_locale), u"-1,5E+300");
  EXPECT_EQ(number_to_text(Currency{std::numeric_limits<std::int64_t>::min()}), u"-922337203685477.5808");
  EXPECT_EQ(number_to_text(Currency{10500}, comma_locale), u"1,05");
}

TEST(Numbers, WholeTexts) {
  // As a number, a currency and a whole number of 16 and 32 bits.
  const testing::Rows<TextView, std::string, std::string, std::string, std::string> rows = {
      {"brackets", u"($1,234.5)", "-1234.5", "-1234.5", "-1234", "-1234"},
      {"separators anywhere behind a digit", u"1,0,0,", "100", "100", "100", "100"},
      {"bits of either width", u" &hffff ", "65535", "65535", "-1", "65535"},
      {"bits of one width", u"&HFFFFFFFF", "4294967295", "4294967295", "error 6", "-1"},
      {"signed bits", u"-&H8000", "-32768", "-32768", "-32768", "-32768"},
      {"above half by little", u"2.5000000000000000001", "2.5", "2.5", "3", "3"},
      {"half a ten-thousandth", u"-0.0000500000000000000000001", "-5E-05", "-0.0001", "0", "0"},
      {"largest currency", u"922337203685477.5807", "922337203685478", "922337203685477.5807", "error 6", "error 6"},
      {"lowest", u"-922337203685477.5808", "-922337203685478", "-922337203685477.5808", "error 6", "error 6"},
      {"one more", u"922337203685477.5808", "922337203685478", "error 6", "error 6", "error 6"},
      {"one digit more than 64 bits hold", u"1e16", "1E+16", "error 6", "error 6", "error 6"},
  };
  const auto check = [](TextView text, const auto& number, const auto& currency, const auto& as_16, const auto& as_32) {
    EXPECT_EQ(outcome([&] { return text_to_number(text); }), number);
    EXPECT_EQ(outcome([&] { return text_to_currency(text); }), currency);
    EXPECT_EQ(outcome([&] { return text_to_integer<std::int16_t>(text); }), as_16);
    EXPECT_EQ(outcome([&] { return text_to_integer<std::int32_t>(text); }), as_32);
  };
  check_rows(rows, check);
  for (const TextView none : {u"-5-", u"(5", u"\u00A35", u",1", u"&H", u"\uFF15", u"abc", u"1x", u" "}) {
    SCOPED_TRACE(to_utf8(none));
    check(none, "none", "none", "none", "none");
  }
  EXPECT_EQ(text_to_number(u"\u20AC 1.234,5", comma_locale), 1234.5);
}

TEST(Numbers, Rounding) {
  const testing::Rows<double, std::string, std::string> rows = {
      {"a little above half a ten-thousandth", 0.00005, "0", "0.0001"},
      {"a little below", 0.00015, "0", "0.0001"},
      {"a tie in two powers", 0.03125, "0", "0.0312"},
      {"largest currency", 922337203685477.5, "error 6", "922337203685477.5"},
      {"beyond", -922337203685477.625, "error 6", "error 6"},
      {"not a number", std::numeric_limits<double>::quiet_NaN(), "error 6", "error 6"},
  };
  check_rows(rows, [](double value, const std::string& to_16, const std::string& to_currency) {
    EXPECT_EQ(outcome([&] { return round_to<std::int16_t>(value); }), to_16);
    EXPECT_EQ(outcome([&] { return number_to_currency(value); }), to_currency);
  });
}

}  // namespace
}  // namespace talutil
