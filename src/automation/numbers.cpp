#include "automation/numbers.hpp"

#include <array>
#include <charconv>
#include <cmath>
#include <cstdlib>
#include <string>

#include "automation/decimal_digits.hpp"
#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

/// Plain if it fits into the digits, with an exponent otherwise. Windows never writes more decimal places than digits:
/// 3.5 / 42 is 8.33333333333333E-02.
std::string plain_or_scientific(const DecimalDigits& number, int most_digits) {
  constexpr int least_plain_exponent = -4;
  const std::string& digits = number.digits;
  const int count = static_cast<int>(digits.size());
  const int exponent = number.exponent;
  if (exponent >= 0 && exponent < most_digits) {
    if (count <= exponent + 1) return digits + std::string(static_cast<std::size_t>(exponent + 1 - count), '0');
    const auto whole = static_cast<std::size_t>(exponent + 1);
    return digits.substr(0, whole) + "." + digits.substr(whole);
  }
  if (exponent < 0 && exponent >= least_plain_exponent && count - exponent - 1 <= most_digits) {
    return "0." + std::string(static_cast<std::size_t>(-exponent - 1), '0') + digits;
  }
  const std::string size = std::to_string(std::abs(exponent));
  return digits.substr(0, 1) + (count > 1 ? "." + digits.substr(1) : "") + (exponent < 0 ? "E-" : "E+") +
         (size.size() < 2 ? "0" : "") + size;
}

Text whole_number_to_text(std::int64_t value) {
  std::array<char, 20> buffer;  // NOLINT(cppcoreguidelines-pro-type-member-init): written before it is read.
  const auto written = std::to_chars(buffer.data(), buffer.data() + buffer.size(), value);
  return Text(buffer.data(), written.ptr);
}

Text to_significant_digits(double value, int most_digits, const Locale& locale) {
  // Also drops the sign of a negative zero.
  if (std::abs(value) < exact_powers_of_10[static_cast<std::size_t>(most_digits)] && std::trunc(value) == value) {
    return whole_number_to_text(static_cast<std::int64_t>(value));
  }
  Text text(std::signbit(value) ? u"-" : u"");
  if (std::isnan(value)) return text + u"NAN";
  if (std::isinf(value)) return text + u"INF";
  for (const char c : plain_or_scientific(decimal_digits(std::abs(value), most_digits), most_digits)) {
    text += c == '.' ? locale.decimal_separator : static_cast<char16_t>(c);
  }
  return text;
}

}  // namespace

Text number_to_text(double value, const Locale& locale) { return to_significant_digits(value, 15, locale); }

Text number_to_text(float value, const Locale& locale) { return to_significant_digits(value, 7, locale); }

Text number_to_text(std::int32_t value) { return whole_number_to_text(value); }

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
