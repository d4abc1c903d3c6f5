// Checks what must hold for any text that is read as a number, and for any number: numbers_fuzz -max_len=64
// -runs=10000000
#include <array>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <optional>

#include "automation/checked.hpp"
#include "automation/decimal_digits.hpp"
#include "automation/numbers.hpp"
#include "automation/run_time_error.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

using fuzz::require;

template <class T>
struct Outcome {
  std::optional<T> value{};
  bool is_overflow = false;
  friend bool operator==(const Outcome&, const Outcome&) = default;
};

template <class Read>
auto outcome_of(Read read) -> Outcome<typename decltype(read())::value_type> {
  try {
    return {read()};
  } catch (const RunTimeError& error) {
    require(error.number() == 6, "the one error");
    return {.is_overflow = true};
  }
}

template <class T>
void require_whole(TextView text, const Locale& locale, const Outcome<double>& number) {
  const auto whole = outcome_of([&] { return text_to_integer<T>(text, locale); });
  require(whole.is_overflow || whole.value.has_value() == (number.value || number.is_overflow), "a number is one");
  // Bits beyond the sign count for a whole number, so &HFFFF is -1.
  if (!whole.value || !number.value || text.find(u'&') != TextView::npos) return;
  require(std::abs(*whole.value - *number.value) <= 0.5, "a whole number is the nearest");
}

/// Without blanks, other bases and separators a number is what the C library takes for one.
void check_reading(fuzz::Input input) {
  constexpr TextView pieces[] = {u"0", u"1", u"25", u"007", u"9999", u".", u"-", u"+", u"e", u"E+", u"e-", u"y"};
  Text text;
  for (std::int32_t left = input.whole(0, 7); left > 0; --left) text += input.one_of(pieces);
  const std::string bytes = to_utf8(text);
  char* end = nullptr;
  const double number = std::strtod(bytes.c_str(), &end);
  Outcome<double> expected;
  expected.is_overflow = !std::isfinite(number);
  if (!expected.is_overflow) expected.value = number;
  require(outcome_of([&] { return std::optional(leading_number(text)); }) == expected, "a leading number");
  // Whole texts may have one sign of each kind, behind the number too.
  if (text.find(u"+-") != Text::npos || text.find(u"-+") != Text::npos || text.find_last_of(u"+-") + 1 == text.size())
    return;
  if (bytes.empty() || *end != 0) expected = {};
  require(outcome_of([&] { return text_to_number(text); }) == expected, "a number");
}

/// Numbers of every size, near powers of ten and half-way between two, have the digits that the C library writes.
void check_digits(fuzz::Input input) {
  const std::int32_t whole = input.whole(1, 99'999'999);
  const double numbers[] = {std::ldexp(whole, input.whole(-1070, 990)), whole / 1000.0, whole / 4096.0,
                            std::nextafter(std::pow(10.0, input.whole(-14, 17)), input.whole(0, 1))};
  const double number = input.one_of(numbers);
  const int count = input.whole(0, 2) == 0 ? 15 : input.whole(1, 17);
  std::array<char, 40> expected{};
  std::snprintf(expected.data(), expected.size(), "%.*e", count - 1, number);
  const DecimalDigits digits = decimal_digits(number, count);
  std::string written = digits.digits + std::string(static_cast<std::size_t>(count) - digits.digits.size(), '0');
  if (count > 1) written.insert(1, ".");
  std::array<char, 40> got{};
  std::snprintf(got.data(), got.size(), "%se%+03d", written.c_str(), digits.exponent);
  require(std::string_view(got.data()) == expected.data(), "the digits of a number");
}

/// The nearest whole number to a quotient, the even one of two.
std::int64_t rounded(std::int64_t number, std::int64_t divisor) {
  const std::int64_t rest = ((number % divisor) + divisor) % divisor;
  const std::int64_t below = (number - rest) / divisor;
  return rest * 2 > divisor || (rest * 2 == divisor && below % 2 != 0) ? below + 1 : below;
}

/// Around halves of whole numbers and of ten-thousandths, at the ends of types and elsewhere.
void check_rounding(fuzz::Input input) {
  constexpr std::int64_t powers[] = {1, 10, 100, 1000, 10'000, 100'000, 1'000'000};
  constexpr std::int64_t edges[] = {0, 0, 32767, -32768, 2147483647, -2147483648};
  const auto places = static_cast<std::size_t>(input.whole(1, 6));
  const std::int64_t scale = powers[places];
  const std::int64_t halves[] = {0, scale / 2, places > 4 ? powers[places - 4] / 2 : 0, input.whole(0, 999'999)};
  const std::int64_t number = (input.one_of(edges) + input.whole(-3, 3)) * scale + input.one_of(halves) +
                              input.whole(-1, 1) + input.whole(0, 1) * input.whole(-1000, 1000) * powers[5];
  const std::string digits = std::to_string(std::abs(number) % scale + scale).substr(1);
  const Text text = from_utf8((number < 0 ? "-" : "") + std::to_string(std::abs(number) / scale) + "." + digits);
  const std::int64_t whole = rounded(number, scale);
  require(outcome_of([&] { return text_to_integer<std::int16_t>(text); }) ==
              outcome_of([&] { return std::optional(checked_cast<std::int16_t>(whole)); }),
          "a whole number of 16 bits");
  require(outcome_of([&] { return text_to_integer<std::int32_t>(text); }) ==
              outcome_of([&] { return std::optional(checked_cast<std::int32_t>(whole)); }),
          "a whole number of 32 bits");
  const std::int64_t money = places > 4 ? rounded(number, powers[places - 4]) : number * powers[4 - places];
  require(text_to_currency(text) == Currency{money}, "an amount of money");
}

void check(TextView text) {
  constexpr Locale comma{.decimal_separator = u',', .thousands_separator = u'.', .currency_symbol = {u'k', u'r'}};
  const auto leading = outcome_of([&] { return std::optional(leading_number(text)); });
  require(!leading.value || std::isfinite(*leading.value), "a leading number is finite");
  for (const Locale& locale : {plain_numbers, comma}) {
    const auto number = outcome_of([&] { return text_to_number(text, locale); });
    require(outcome_of([&] { return text_to_number(u" " + Text(text) + u"\t", locale); }) == number, "blanks around");
    require_whole<std::int16_t>(text, locale, number);
    require_whole<std::int32_t>(text, locale, number);
    const auto money = outcome_of([&] { return text_to_currency(text, locale); });
    require(money.is_overflow || money.value.has_value() == (number.value || number.is_overflow), "money is a number");
    if (money.value) {
      require(text_to_currency(number_to_text(*money.value, locale), locale) == money.value, "money comes back");
      const double exact = static_cast<double>(money.value->ten_thousandths) / 10'000;
      require(!number.value || std::abs(exact - *number.value) <= 0.00005001 + std::abs(exact) * 1e-15, "near");
    }
    // Fifteen digits of the largest numbers can be beyond the range.
    constexpr double last_read = 1.79769313486231e308;
    if (!number.value || std::abs(*number.value) > last_read) continue;
    const Text again = number_to_text(*number.value, locale);
    require(number_to_text(text_to_number(again, locale).value(), locale) == again, "a number's text stays");
    const Text plain = number_to_text(*number.value);
    require(text_to_number(plain) == leading_number(plain), "the leading number of a number is itself");
  }
}

/// Maps most bytes to elements of numbers.
void check(const std::uint8_t* data, std::size_t size) {
  constexpr TextView pieces[] = {u"0", u"1",  u"5",   u"9",    u"25", u"007", u"99999999", u".", u",", u"-",
                                 u"+", u"(",  u")",   u"$",    u"kr", u"e",   u"E+",       u"d", u"&", u"&H",
                                 u"F", u"&O", u"308", u"-324", u" ",  u"\t",  u"\u00A0",   u"x"};
  Text text;
  for (const std::uint8_t* at = data; at != data + size; ++at) {
    if (*at < 240)
      text += pieces[*at % std::size(pieces)];
    else
      text += static_cast<char16_t>(*at << 8 | (at == data ? 0 : at[-1]));
  }
  check(text);
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  talutil::check(data, size);
  for (const auto check : {&talutil::check_reading, &talutil::check_digits, &talutil::check_rounding})
    check({data, size, u""});
  return 0;
}
