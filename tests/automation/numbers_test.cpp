#include "automation/numbers.hpp"

#include <gtest/gtest.h>

#include <limits>

#include "automation/checked.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/fakes/rows.hpp"

namespace talutil {
namespace {

using testing::check_rows;
using testing::outcome;

constexpr Locale comma_locale{.decimal_separator = u',', .thousands_separator = u'.', .currency_symbol = {u'\u20AC'}};

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
