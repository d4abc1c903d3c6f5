#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <string>

#include "automation/checked.hpp"
#include "automation/decimal_digits.hpp"
#include "automation/numbers.hpp"

namespace talutil {

namespace {

/// An exact decimal number as written: 0.DIGITS times ten to the power of `point`.
struct Decimal {
  bool is_negative = false;
  std::string digits;  ///< Without leading zeros; empty for 0.
  std::int64_t point = 0;

  void append(char16_t digit, bool is_fraction) {
    if (digits.empty() && digit == u'0') {
      if (is_fraction) --point;
      return;
    }
    digits += static_cast<char>(digit);
    if (!is_fraction) ++point;
  }
};

constexpr bool is_letter(char16_t unit, char16_t upper) noexcept { return unit == upper || unit == upper + 32; }
constexpr bool starts_exponent(char16_t unit) noexcept { return is_letter(unit, u'E') || is_letter(unit, u'D'); }

/// No text is long enough to need a larger exponent, and sums with this one cannot overflow.
constexpr std::int64_t largest_exponent = 1'000'000'000'000;

constexpr std::int64_t append_to_exponent(std::int64_t exponent, char16_t digit) noexcept {
  return std::min(exponent * 10 + (digit - u'0'), largest_exponent);
}

/// A number with so few digits that both its digits and the power of ten are exact, and a single division rounds.
std::optional<double> short_number(const Decimal& decimal) {
  constexpr std::size_t most_digits = exact_powers_of_10.size() - 1;
  const auto count = static_cast<std::int64_t>(decimal.digits.size());
  const std::int64_t places = count - decimal.point;
  if (decimal.digits.size() > most_digits || decimal.point < 0 || places < 0) return std::nullopt;
  std::int64_t whole = 0;
  for (const char digit : decimal.digits) whole = whole * 10 + (digit - '0');
  return static_cast<double>(whole) / exact_powers_of_10[static_cast<std::size_t>(places)];
}

double to_double(const Decimal& decimal) {
  constexpr std::int64_t surely_too_large = 400;
  constexpr std::int64_t surely_zero = -400;
  if (decimal.digits.empty() || decimal.point < surely_zero) return 0;
  if (const auto number = short_number(decimal)) return decimal.is_negative ? -*number : *number;
  if (decimal.point > surely_too_large) raise(ErrorNumber::overflow);
  const std::string text = "0." + decimal.digits + "e" + std::to_string(decimal.point);
  double value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  const bool is_too_small = decimal.point <= 0;
  if (error == std::errc::result_out_of_range && is_too_small) return 0;
  if (error != std::errc{}) raise(ErrorNumber::overflow);
  return decimal.is_negative ? -value : value;
}

/// The number times ten to the power of `places` as a whole number, halves rounded to even.
std::int64_t to_scaled_integer(const Decimal& decimal, int places) {
  constexpr std::int64_t most_digits = 19;
  const std::string& digits = decimal.digits;
  const std::int64_t kept = decimal.point + places;
  if (digits.empty() || kept < 0) return 0;
  if (kept > most_digits) raise(ErrorNumber::overflow);

  const auto count = static_cast<std::size_t>(kept);
  std::uint64_t whole = 0;
  for (std::size_t i = 0; i < count; ++i) {
    whole = whole * 10 + (i < digits.size() ? static_cast<std::uint64_t>(digits[i] - '0') : 0U);
  }
  if (count < digits.size()) {
    const bool is_above_half = digits[count] > '5' || digits.find_first_not_of('0', count + 1) != std::string::npos;
    if (digits[count] >= '5' && (is_above_half || whole % 2 != 0)) ++whole;
  }
  constexpr auto highest = static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max());
  if (whole > highest + (decimal.is_negative ? 1U : 0U)) raise(ErrorNumber::overflow);
  return static_cast<std::int64_t>(decimal.is_negative ? 0U - whole : whole);
}

/// Characters that hosts skip within a number.
constexpr bool is_skipped_by_val(char16_t unit) noexcept {
  return unit == u' ' || unit == u'\t' || unit == u'\n' || unit == u'\r' || unit == 0x3000;
}

/// Reads a text character by character, skipping some.
class Reader {
 public:
  explicit Reader(TextView text, bool (*is_skipped)(char16_t) noexcept = nullptr) noexcept
      : rest_(text), is_skipped_(is_skipped) {}

  /// The next character; 0 at the end.
  [[nodiscard]] char16_t peek() noexcept {
    while (is_skipped_ != nullptr && !rest_.empty() && is_skipped_(rest_.front())) rest_.remove_prefix(1);
    return rest_.empty() ? u'\0' : rest_.front();
  }
  char16_t take() noexcept {
    const char16_t unit = peek();
    if (!rest_.empty()) rest_.remove_prefix(1);
    return unit;
  }
  bool take_if(char16_t wanted) noexcept {
    const bool is_next = wanted != 0 && peek() == wanted;
    if (is_next) take();
    return is_next;
  }
  bool take_if(TextView wanted) noexcept {
    const bool is_next = !wanted.empty() && rest_.starts_with(wanted);
    if (is_next) rest_.remove_prefix(wanted.size());
    return is_next;
  }
  [[nodiscard]] bool is_at_end() const noexcept { return rest_.empty(); }

 private:
  TextView rest_;
  bool (*is_skipped_)(char16_t) noexcept;
};

constexpr int digit_value(char16_t unit) noexcept {
  if (is_decimal_digit(unit)) return unit - u'0';
  for (char16_t letter = u'A'; letter <= u'F'; ++letter) {
    if (is_letter(unit, letter)) return 10 + (letter - u'A');
  }
  return 16;
}

/// The part of a hexadecimal or octal number after "&", as an unsigned number.
std::optional<double> read_bits(Reader& reader) {
  int base = 0;
  if (is_letter(reader.peek(), u'H')) base = 16;
  if (is_letter(reader.peek(), u'O')) base = 8;
  if (base == 0) return {};
  reader.take();
  if (digit_value(reader.peek()) >= base) return {};
  double value = 0;
  while (digit_value(reader.peek()) < base) value = value * base + digit_value(reader.take());
  if (std::isinf(value)) raise(ErrorNumber::overflow);
  return value;
}

/// Reads a complete exponent. If it is incomplete, the reader stops after its letter and sign.
bool read_exponent(Reader& reader, Decimal& decimal) {
  reader.take();
  const bool is_negative = reader.take_if(u'-');
  if (!is_negative) reader.take_if(u'+');
  if (!is_decimal_digit(reader.peek())) return false;
  std::int64_t exponent = 0;
  while (is_decimal_digit(reader.peek())) exponent = append_to_exponent(exponent, reader.take());
  decimal.point += is_negative ? -exponent : exponent;
  return true;
}

template <class Bits>
constexpr double highest_bits = static_cast<double>(std::numeric_limits<Bits>::max());

/// Reinterprets the bits of an unsigned number as a signed one if they fit its width.
template <std::signed_integral To>
std::optional<To> as_signed(double bits) noexcept {
  using Bits = std::make_unsigned_t<To>;
  if (bits > highest_bits<Bits>) return {};
  return static_cast<To>(static_cast<Bits>(bits));
}

double leading_bits(Reader& reader) {
  const double bits = read_bits(reader).value_or(0);
  if (reader.take_if(u'&')) return bits;
  if (const auto number = as_signed<std::int16_t>(bits)) return *number;
  if (const auto number = as_signed<std::int32_t>(bits)) return *number;
  return bits;
}

/// Reads digits with at most one decimal point. Thousands separators (0 for none) may be anywhere after the first
/// digit, as on the platform. Returns false if there is no digit.
bool read_digits(Reader& reader, char16_t point, char16_t thousands, Decimal& decimal) {
  bool has_digit = false;
  bool is_fraction = false;
  for (;;) {
    const char16_t unit = reader.peek();
    if (is_decimal_digit(unit)) {
      decimal.append(unit, is_fraction);
      has_digit = true;
    } else if (unit == point && !is_fraction) {
      is_fraction = true;
    } else if (unit == 0 || unit != thousands || !has_digit) {
      return has_digit;
    }
    reader.take();
  }
}

/// The marks that may appear around a number, on either side, each at most once.
class Marks {
 public:
  enum class Side : std::uint8_t { before, behind };

  explicit Marks(const Locale& locale) noexcept : currency_(locale.currency()) {}

  void read(Reader& reader, Side side) noexcept {
    const std::size_t wrong_bracket = side == Side::before ? closing : opening;
    for (;;) {
      if (!has_currency_ && reader.take_if(currency_)) {
        has_currency_ = true;
        continue;
      }
      const char16_t unit = reader.peek();
      const auto at = static_cast<std::size_t>(std::ranges::find(units_, unit) - units_.begin());
      const bool is_mark = unit != 0 && at < units_.size() && at != wrong_bracket && !seen_[at];
      if (!is_mark && !is_white_space(unit)) return;
      if (is_mark) seen_[at] = true;
      reader.take();
    }
  }

  [[nodiscard]] bool are_balanced() const noexcept { return seen_[opening] == seen_[closing]; }
  [[nodiscard]] bool are_negative() const noexcept { return seen_[minus] || seen_[opening]; }

 private:
  static constexpr std::size_t minus = 1;
  static constexpr std::size_t opening = 2;
  static constexpr std::size_t closing = 3;
  static constexpr std::array<char16_t, 4> units_{u'+', u'-', u'(', u')'};
  std::array<bool, units_.size()> seen_{};
  TextView currency_;
  bool has_currency_ = false;
};

struct Reading {
  Decimal decimal;
  std::optional<double> bits;  ///< Set for a hexadecimal or octal number, instead of the decimal.
};

std::optional<Reading> read_number(TextView text, const Locale& locale) {
  Reader reader(text);
  Reading reading;
  Marks marks(locale);
  marks.read(reader, Marks::Side::before);
  if (reader.take_if(u'&')) {
    reading.bits = read_bits(reader);
    if (!reading.bits) return {};
  } else {
    if (!read_digits(reader, locale.decimal_separator, locale.thousands_separator, reading.decimal)) return {};
    if (starts_exponent(reader.peek()) && !read_exponent(reader, reading.decimal)) return {};
  }
  marks.read(reader, Marks::Side::behind);
  if (!reader.is_at_end() || !marks.are_balanced()) return {};
  reading.decimal.is_negative = marks.are_negative();
  if (reading.bits && marks.are_negative()) reading.bits = -*reading.bits;
  return reading;
}

}  // namespace

double leading_number(TextView text) {
  Reader reader(text, is_skipped_by_val);
  Decimal decimal;
  decimal.is_negative = reader.take_if(u'-');
  if (!decimal.is_negative) reader.take_if(u'+');
  if (reader.take_if(u'&')) return decimal.is_negative ? -leading_bits(reader) : leading_bits(reader);

  const bool has_digit = read_digits(reader, u'.', 0, decimal);
  if (has_digit && starts_exponent(reader.peek())) read_exponent(reader, decimal);
  return to_double(decimal);
}

std::optional<double> text_to_number(TextView text, const Locale& locale) {
  const auto reading = read_number(text, locale);
  if (!reading) return {};
  return reading->bits ? *reading->bits : to_double(reading->decimal);
}

std::optional<Currency> text_to_currency(TextView text, const Locale& locale) {
  constexpr int places = 4;
  const auto reading = read_number(text, locale);
  if (!reading) return {};
  return reading->bits ? number_to_currency(*reading->bits) : Currency{to_scaled_integer(reading->decimal, places)};
}

template <std::signed_integral To>
std::optional<To> text_to_integer(TextView text, const Locale& locale) {
  const auto reading = read_number(text, locale);
  if (!reading) return {};
  if (!reading->bits) return checked_cast<To>(to_scaled_integer(reading->decimal, 0));
  if (*reading->bits < 0) return round_to<To>(*reading->bits);
  const auto number = as_signed<To>(*reading->bits);
  if (!number) raise(ErrorNumber::overflow);
  return number;
}

template std::optional<std::int16_t> text_to_integer(TextView text, const Locale& locale);
template std::optional<std::int32_t> text_to_integer(TextView text, const Locale& locale);

}  // namespace talutil
