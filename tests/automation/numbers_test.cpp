#include "automation/numbers.hpp"

#include <gtest/gtest.h>

#include <limits>

#include "automation/checked.hpp"
#include "tests/automation/outcome.hpp"

namespace talutil {
namespace {

constexpr double infinity = std::numeric_limits<double>::infinity();
constexpr Locale comma_locale{.decimal_separator = u',', .thousands_separator = u'.', .currency_symbol = {u'\u20AC'}};

struct ReadingRow {
  const char* name;
  TextView text;
  const char* expected;
};

TEST(Numbers, LeadingNumber) {
  const ReadingRow rows[] = {
      {"stops at a letter", u"12abc", "12"},
      {"no number", u"abc", "0"},
      {"empty", u"", "0"},
      {"stops at a comma", u"1,000", "1"},
      {"skips between digits", u" 4 5", "45"},
      {"skips every kind of blank", u"\t-\r1\n2\u3000. 5 e \u30001", "-125"},
      {"stops at a no-break blank", u"1\u00A02", "1"},
      {"a second full stop ends it", u"1.5.5", "1.5"},
      {"sign alone", u"-", "0"},
      {"one sign only", u"--5", "0"},
      {"full stop first", u".5x", "0.5"},
      {"full stop alone", u".e5", "0"},
      {"exponent", u"1e5", "100000"},
      {"exponent after D", u"25D-1", "2.5"},
      {"exponent without digits", u"1e", "1"},
      {"exponent with a sign only", u"1e+x", "1"},
      {"hexadecimal of 16 bits is signed", u"&HFFFF", "-1"},
      {"leading zeros do not widen it", u"&h0007fffx", "32767"},
      {"with a mark behind it is not", u"&HFFFF&", "65535"},
      {"32 bits are signed", u"& H F FFFF FFF", "-1"},
      {"17 bits", u"&H10000", "65536"},
      {"more bits are not", u"&H100000000", "4294967296"},
      {"octal stops at 8", u"&O178", "15"},
      {"no base", u"&17", "0"},
      {"no bits", u"&HG", "0"},
      {"largest", u"17976931348623157e292", "1.79769313486232E+308"},
      {"too large", u"1E400", "error 6"},
      {"just too large", u"1.7976931348623159e308", "error 6"},
      {"too large by far", u"-1E99999999999999999999", "error 6"},
      {"zero with a huge exponent", u"0E99999", "0"},
      {"too small", u"1E-400", "0"},
      {"leading zeros count against the exponent", u"0.0001E312", "1E+308"},
  };
  for (const auto& row : rows) EXPECT_EQ(outcome([&] { return leading_number(row.text); }), row.expected) << row.name;
}

TEST(Numbers, LongTextsTakeLinearTime) {
  constexpr std::size_t length = 2U << 20;  // Quadratic work would not end.
  EXPECT_EQ(leading_number(Text(length, u' ') + u"7" + Text(length, u' ')), 7);
  EXPECT_EQ(leading_number(u"." + Text(length, u'0') + u"1e" + Text(length, u'0')), 0);
  EXPECT_EQ(text_to_number(Text(length, u' ') + u"7" + Text(length, u' ')), 7);
  EXPECT_EQ(upper_case(from_ansi(to_ansi(Text(length, u'\u00E9')))).back(), u'\u00C9');
}

TEST(Numbers, ToText) {
  const struct {
    const char* name;
    double value;
    TextView expected;
    TextView expected_single;
  } rows[] = {
      {"negative zero", -0.0, u"0", u"0"},
      {"as many decimal places as digits", 0.012345678901234, u"0.012345678901234", u"1.234568E-02"},
      {"one more", -3.5 / 42, u"-8.33333333333333E-02", u"-8.333334E-02"},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(number_to_text(row.value), row.expected) << row.name;
    EXPECT_EQ(number_to_text(static_cast<float>(row.value)), row.expected_single) << row.name;
  }
  EXPECT_EQ(number_to_text(-1.5e300, comma_locale), u"-1,5E+300");
  EXPECT_EQ(number_to_text(std::numeric_limits<std::int32_t>::min()), u"-2147483648");
}

TEST(Numbers, CurrencyToText) {
  EXPECT_EQ(number_to_text(Currency{std::numeric_limits<std::int64_t>::min()}), u"-922337203685477.5808");
  EXPECT_EQ(number_to_text(Currency{10500}, comma_locale), u"1,05");
}

TEST(Numbers, WholeTexts) {
  const ReadingRow rows[] = {
      {"blanks around", u" \t5\u00A0", "5"},
      {"empty", u"", "none"},
      {"signs at both ends", u"-5-", "none"},
      {"brackets", u"($1,234.5)", "-1234.5"},
      {"bracket left open", u"(5", "none"},
      {"another currency", u"\u00A35", "none"},
      {"separators anywhere behind a digit", u"1,0,0,", "100"},
      {"separator first", u",1", "none"},
      {"two full stops", u"1.5.5", "none"},
      {"hexadecimal has no sign of its own", u" &hffff ", "65535"},
      {"wide hexadecimal", u"&HFFFFFFFFFF", "1099511627775"},
      {"no bits", u"&H", "none"},
      {"digits of another script", u"\uFF15", "none"},
      {"too large", u"1E400", "error 6"},
      {"too small", u"-1E-400", "0"},
  };
  for (const auto& row : rows) EXPECT_EQ(outcome([&] { return text_to_number(row.text); }), row.expected) << row.name;
  EXPECT_EQ(text_to_number(u"\u20AC 1.234,5", comma_locale), 1234.5);
  EXPECT_EQ(text_to_number(u"0.1"), 0.1);
}

TEST(Numbers, TextToCurrencyAndIntegers) {
  const ReadingRow currency[] = {
      {"half to even, down", u"1.00005", "1"},
      {"half to even, up", u"1.00015", "1.0002"},
      {"above half", u"1.0000500000000000000000001", "1.0001"},
      {"below a ten-thousandth", u"0.00004", "0"},
      {"half a ten-thousandth", u"-0.000050001", "-0.0001"},
      {"exact where a double is not", u"922337203685477.5807", "922337203685477.5807"},
      {"lowest", u"-922337203685477.5808", "-922337203685477.5808"},
      {"one more", u"922337203685477.5808", "error 6"},
      {"one digit more than 64 bits hold", u"1e16", "error 6"},
      {"hexadecimal", u"&HFFFF", "65535"},
      {"no number", u"abc", "none"},
  };
  for (const auto& row : currency) {
    EXPECT_EQ(outcome([&] { return text_to_currency(row.text); }), row.expected) << row.name;
  }
  const struct {
    const char* name;
    TextView text;
    const char* expected_16;
    const char* expected_32;
  } integers[] = {
      {"half to even", u"2.5", "2", "2"},
      {"above half by little", u"2.5000000000000000001", "3", "3"},
      {"bits of either width", u"&HFFFF", "-1", "65535"},
      {"bits of one width", u"&HFFFFFFFF", "error 6", "-1"},
      {"too many bits", u"&H100000000", "error 6", "error 6"},
      {"signed bits", u"-&H8000", "-32768", "-32768"},
      {"16-bit edge", u"32767.5", "error 6", "32768"},
      {"32-bit edge", u"-2147483648.5", "error 6", "-2147483648"},
      {"beyond it", u"2147483647.5", "error 6", "error 6"},
      {"no number", u"1x", "none", "none"},
  };
  for (const auto& row : integers) {
    EXPECT_EQ(outcome([&] { return text_to_integer<std::int16_t>(row.text); }), row.expected_16) << row.name;
    EXPECT_EQ(outcome([&] { return text_to_integer<std::int32_t>(row.text); }), row.expected_32) << row.name;
  }
}

TEST(Numbers, Rounding) {
  const struct {
    const char* name;
    double value;
    const char* to_16;
    const char* to_currency;
  } rows[] = {
      {"just above half", 2.5000000000000004, "3", "2.5"},
      {"a little above half a ten-thousandth", 0.00005, "0", "0.0001"},
      {"a little below", 0.00015, "0", "0.0001"},
      {"a tie in two powers", 0.03125, "0", "0.0312"},
      {"half of the smallest", 1e-300, "0", "0"},
      {"largest currency", 922337203685477.5, "error 6", "922337203685477.5"},
      {"beyond", -922337203685477.625, "error 6", "error 6"},
      {"infinite", infinity, "error 6", "error 6"},
      {"not a number", infinity - infinity, "error 6", "error 6"},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(outcome([&] { return round_to<std::int16_t>(row.value); }), row.to_16) << row.name;
    EXPECT_EQ(outcome([&] { return number_to_currency(row.value); }), row.to_currency) << row.name;
  }
}

TEST(Numbers, CheckedArithmetic) {
  constexpr std::int16_t highest = std::numeric_limits<std::int16_t>::max();
  constexpr std::int16_t one = 1;
  EXPECT_EQ(checked_add<std::int16_t>(highest, -1), highest - 1);
  EXPECT_EQ(outcome([] { return checked_add(highest, one); }), "error 6");
  EXPECT_EQ(outcome([] { return checked_subtract<std::int32_t>(std::numeric_limits<std::int32_t>::min(), 1); }),
            "error 6");
  EXPECT_EQ(outcome([] { return checked_multiply<std::int32_t>(65536, 32768); }), "error 6");
  EXPECT_EQ(outcome([] { return checked_cast<std::int16_t>(32768U); }), "error 6");
  EXPECT_EQ(outcome([] { return checked_cast<std::int16_t>(std::int64_t{-32768}); }), "-32768");
}

TEST(RunTimeError, CarriesNumberAndText) {
  const RunTimeError standard(ErrorNumber::subscript_out_of_range);
  EXPECT_EQ(standard.number(), 9);
  EXPECT_EQ(standard.description(), u"Subscript out of range");
  EXPECT_STREQ(RunTimeError(9, u"caf\u00E9").what(), "caf\xC3\xA9");
  EXPECT_EQ(standard_description(12345), "Application-defined or object-defined error");
}

}  // namespace
}  // namespace talutil
