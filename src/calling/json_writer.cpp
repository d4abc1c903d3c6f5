#include "calling/json_writer.hpp"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <limits>

#include "automation/decimal_digits.hpp"

namespace talutil::calling {

namespace {

constexpr bool is_high_surrogate(char16_t unit) noexcept { return (unit & 0xFC00) == 0xD800; }
constexpr bool is_low_surrogate(char16_t unit) noexcept { return (unit & 0xFC00) == 0xDC00; }

/// Characters that stand for themselves in one byte.
constexpr bool is_plain(char16_t unit) noexcept {
  return unit >= u' ' && unit < u'\x7F' && unit != u'"' && unit != u'\\';
}

void append_escape(std::string& out, char16_t unit) {
  constexpr std::u16string_view units = u"\"\\\n\r\t";
  constexpr std::string_view names = "\"\\nrt";
  const std::size_t found = units.find(unit);
  out += '\\';
  if (found != std::u16string_view::npos) {
    out += names[found];
    return;
  }
  constexpr std::string_view digits = "0123456789abcdef";
  out += 'u';
  for (int shift = 12; shift >= 0; shift -= 4) out += digits[(unit >> shift) & 0xF];
}

void append_bytes(std::string& out, char32_t code) {
  const auto tail = [&](int shift) { out += static_cast<char>(0x80 | ((code >> shift) & 0x3F)); };
  if (code < 0x800) {
    out += static_cast<char>(0xC0 | (code >> 6));
  } else if (code < 0x10000) {
    out += static_cast<char>(0xE0 | (code >> 12));
    tail(6);
  } else {
    out += static_cast<char>(0xF0 | (code >> 18));
    tail(12);
    tail(6);
  }
  tail(0);
}

}  // namespace

void append_text(std::string& out, TextView text) {
  out += '"';
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char16_t unit = text[i];
    if (is_plain(unit)) {
      out += static_cast<char>(unit);
    } else if (is_high_surrogate(unit) && i + 1 < text.size() && is_low_surrogate(text[i + 1])) {
      append_bytes(out, 0x10000U + ((unit - 0xD800U) << 10) + (text[++i] - 0xDC00U));
    } else if (unit < 0x80 || is_high_surrogate(unit) || is_low_surrogate(unit)) {
      append_escape(out, unit);
    } else {
      append_bytes(out, unit);
    }
  }
  out += '"';
}

namespace {

void append_decimal(std::string& out, const DecimalDigits& number) {
  constexpr int most_plain_digits = 16;
  constexpr int least_plain_exponent = -4;
  const std::string& digits = number.digits;
  const int count = static_cast<int>(digits.size());
  const int exponent = number.exponent;
  const auto whole = static_cast<std::size_t>(std::max(exponent + 1, 0));
  if (exponent >= least_plain_exponent && exponent < 0) {
    out += "0." + std::string(static_cast<std::size_t>(-exponent - 1), '0') + digits;
  } else if (exponent >= 0 && exponent < most_plain_digits) {
    out.append(digits, 0, whole);
    if (count > exponent + 1)
      out.append(1, '.').append(digits, whole);
    else
      out.append(whole - digits.size(), '0');
  } else {
    out += digits.front();
    if (count > 1) out.append(1, '.').append(digits, 1);
    out += exponent < 0 ? "e-" : "e+";
    if (std::abs(exponent) < 10) out += '0';
    out += std::to_string(std::abs(exponent));
  }
}

/// @param enough so many digits always read back as the same value
template <class Number>
void append_shortest(std::string& out, Number value, int enough) {
  if (std::signbit(value)) out += '-';
  value = std::abs(value);
  if (value == 0) {
    out += '0';
    return;
  }
  std::string written;
  // Up to these digits, all numbers can be read back, but not those that are too small to have all their bits.
  const bool is_normal = value >= std::numeric_limits<Number>::min();
  for (int count = is_normal ? std::numeric_limits<Number>::digits10 : 1; count <= enough; ++count) {
    written.clear();
    append_decimal(written, decimal_digits(value, count));
    Number again = 0;
    std::from_chars(written.data(), written.data() + written.size(), again);
    if (again == value) break;
  }
  out += written;
}

}  // namespace

void append_number(std::string& out, double value) {
  append_shortest(out, value, std::numeric_limits<double>::max_digits10);
}

void append_number(std::string& out, float value) {
  append_shortest(out, value, std::numeric_limits<float>::max_digits10);
}

}  // namespace talutil::calling
