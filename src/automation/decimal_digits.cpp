#include "automation/decimal_digits.hpp"

#include <array>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <optional>

namespace talutil {

namespace {

constexpr int mantissa_bits = 53;
constexpr int word_bits = 64;
constexpr int most_fives = 27;  // The largest power of 5 in 64 bits.

constexpr auto powers_of_5 = [] {
  std::array<std::uint64_t, most_fives + 1> powers{1};
  for (std::size_t i = 1; i < powers.size(); ++i) powers[i] = powers[i - 1] * 5;
  return powers;
}();

constexpr auto powers_of_10 = [] {
  std::array<std::uint64_t, 18> powers{1};
  for (std::size_t i = 1; i < powers.size(); ++i) powers[i] = powers[i - 1] * 10;
  return powers;
}();

struct Wide {
  std::uint64_t high = 0;
  std::uint64_t low = 0;
};

Wide multiplied(std::uint64_t a, std::uint64_t b) {
  constexpr std::uint64_t half = 0xFFFFFFFF;
  const std::uint64_t low = (a & half) * (b & half);
  const std::uint64_t middle = (a >> 32) * (b & half) + (low >> 32);
  const std::uint64_t other = (a & half) * (b >> 32) + (middle & half);
  return {(a >> 32) * (b >> 32) + (middle >> 32) + (other >> 32), (other << 32) | (low & half)};
}

/// The number divided by 2 to the power of `bits`, 1 to 127, to the nearest; the quotient fits into 64 bits.
std::uint64_t shifted_to_nearest(const Wide& number, int bits) {
  const bool is_long = bits >= word_bits;
  const int rest = bits % word_bits;
  const std::uint64_t upper = is_long ? number.high : number.low;
  std::uint64_t quotient = upper;
  if (rest > 0) quotient = upper >> rest;
  if (!is_long) quotient |= number.high << (word_bits - rest);
  // What is cut off, as a fraction of 2 to the power of 64, and whether more follows.
  const std::uint64_t below = is_long ? number.low : 0;
  const std::uint64_t fraction = rest > 0 ? (upper << (word_bits - rest)) | (below >> rest) : below;
  const bool is_more = rest > 0 && (below << (word_bits - rest)) != 0;
  constexpr std::uint64_t half = std::uint64_t{1} << 63;
  const bool rounds_up = fraction > half || (fraction == half && (is_more || quotient % 2 != 0));
  return quotient + (rounds_up ? 1 : 0);
}

/// Numbers of the usual size, exactly, in whole-number arithmetic. The C library takes ten times as long.
std::optional<DecimalDigits> usual_digits(double value, int count) {
  int exponent_of_2 = 0;
  const double fraction = std::frexp(value, &exponent_of_2);
  const auto mantissa = static_cast<std::uint64_t>(std::ldexp(fraction, mantissa_bits));
  exponent_of_2 -= mantissa_bits;
  // One too few at most: the logarithm is taken of the power of two below.
  constexpr double log10_of_2 = 0.30102999566398120;
  int exponent = static_cast<int>(std::floor((exponent_of_2 + mantissa_bits - 1) * log10_of_2));
  for (;; ++exponent) {
    const int scale = count - 1 - exponent;
    if (scale < 0 || scale > most_fives) return std::nullopt;
    const Wide product = multiplied(mantissa, powers_of_5[static_cast<std::size_t>(scale)]);
    const int bits = -(exponent_of_2 + scale);
    if (bits < 1 || bits >= 2 * word_bits) return std::nullopt;
    if (bits < word_bits && (product.high >> bits) != 0) continue;  // Longer than a word, so longer than wanted.
    const std::uint64_t whole = shifted_to_nearest(product, bits);
    // Before rounding it may have had fewer digits: 9.9996 to four digits is 1000 with the next exponent.
    if (whole >= powers_of_10[static_cast<std::size_t>(count)]) continue;
    std::string digits = std::to_string(whole);
    digits.erase(digits.find_last_not_of('0') + 1);
    return DecimalDigits{std::move(digits), exponent};
  }
}

}  // namespace

DecimalDigits decimal_digits(double value, int count) {
  if (auto usual = usual_digits(value, count)) return *usual;
  std::array<char, 40> text;
  std::snprintf(text.data(), text.size(), "%.*e", count - 1, value);
  DecimalDigits result;
  const std::string written(text.data());
  const std::size_t end = written.find('e');
  // Whatever a host has chosen for the decimal separator.
  for (const char c : written.substr(0, end)) {
    if (c >= '0' && c <= '9') result.digits += c;
  }
  result.digits.erase(result.digits.find_last_not_of('0') + 1);
  result.exponent = std::stoi(written.substr(end + 1));
  return result;
}

}  // namespace talutil
