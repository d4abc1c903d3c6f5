#include "automation/numbers.hpp"

#include <array>
#include <charconv>
#include <cmath>
#include <string_view>

#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

/// The number of significant digits of a fraction below 1 that is written without an exponent; 0 for other numbers.
std::size_t digits_of_fraction(std::string_view number) noexcept {
  if (number.starts_with('-')) number.remove_prefix(1);
  return number.starts_with("0.") ? number.size() - number.find_first_of("123456789") : 0;
}

template <class Number>
Text to_significant_digits(Number value, int digits, const Locale& locale) {
  if (value == 0) return u"0";  // Drops the sign of a negative zero.
  std::array<char, 32> buffer;
  char* const end = buffer.data() + buffer.size();
  auto written = std::to_chars(buffer.data(), end, value, std::chars_format::general, digits);
  // Windows never writes more decimal places than digits: 3.5 / 42 is 8.33333333333333E-02.
  const std::string_view plain(buffer.data(), written.ptr);
  const std::size_t fraction_digits = digits_of_fraction(plain);
  if (fraction_digits > 0 && plain.size() - plain.find('.') - 1 > static_cast<std::size_t>(digits)) {
    const int places = static_cast<int>(fraction_digits) - 1;
    written = std::to_chars(buffer.data(), end, value, std::chars_format::scientific, places);
  }
  Text text(buffer.data(), written.ptr);
  for (char16_t& unit : text) unit = unit == u'.' ? locale.decimal_separator : upper_case(unit);
  return text;
}

}  // namespace

Text number_to_text(double value, const Locale& locale) { return to_significant_digits(value, 15, locale); }

Text number_to_text(float value, const Locale& locale) { return to_significant_digits(value, 7, locale); }

Text number_to_text(std::int32_t value) {
  std::array<char, 12> buffer;
  const auto written = std::to_chars(buffer.data(), buffer.data() + buffer.size(), value);
  return Text(buffer.data(), written.ptr);
}

Text number_to_text(Currency value, const Locale& locale) {
  const bool is_negative = value.ten_thousandths < 0;
  auto rest = static_cast<std::uint64_t>(value.ten_thousandths);
  if (is_negative) rest = 0U - rest;

  Text backwards;
  const auto write_digit = [&] {
    backwards += static_cast<char16_t>(u'0' + rest % 10);
    rest /= 10;
  };
  for (int place = 4; place > 0; --place) {
    if (backwards.empty() && rest % 10 == 0)
      rest /= 10;
    else
      write_digit();
  }
  if (!backwards.empty()) backwards += locale.decimal_separator;
  do write_digit();
  while (rest != 0);
  if (is_negative) backwards += u'-';
  return Text(backwards.rbegin(), backwards.rend());
}

Currency number_to_currency(double value) {
  constexpr int mantissa_bits = 53;
  constexpr double beyond = 1e15;  // Currency ends slightly below this.
  if (!(std::abs(value) < beyond)) raise(ErrorNumber::overflow);

  // Exact: the number is mantissa times a power of two, and 10000 is 625 times 2 to the power of 4.
  int exponent = 0;
  const double fraction = std::frexp(std::abs(value), &exponent);
  const std::uint64_t product = static_cast<std::uint64_t>(std::ldexp(fraction, mantissa_bits)) * 625;
  const int shift = mantissa_bits - exponent - 4;
  std::uint64_t whole = 0;
  if (shift <= 0) {
    whole = product << -shift;
  } else if (shift < 64) {
    const std::uint64_t half = std::uint64_t{1} << (shift - 1);
    const std::uint64_t rest = product & (half | (half - 1));
    whole = product >> shift;
    if (rest > half || (rest == half && whole % 2 != 0)) ++whole;
  }
  constexpr auto highest = static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max());
  if (whole > highest) raise(ErrorNumber::overflow);
  const auto magnitude = static_cast<std::int64_t>(whole);
  return {value < 0 ? -magnitude : magnitude};
}

}  // namespace talutil
