#pragma once

#include <concepts>
#include <cstdint>
#include <optional>

#include "automation/locale.hpp"
#include "automation/text.hpp"

namespace talutil {

/// Automation's currency: a number of ten-thousandths.
struct Currency {
  std::int64_t ten_thousandths = 0;
  friend constexpr bool operator==(Currency, Currency) noexcept = default;
};

/// Reads the longest number at the start of a text, as the hosts' Val does; 0 if there is none. Blanks, tabs and line
/// breaks are skipped everywhere. Understands a sign, digits, one full stop (whatever the locale), an exponent after E
/// or D, and the prefixes &H and &O; stops at the first other character. &H and &O numbers are signed 16-bit numbers if
/// they fit into 16 bits and otherwise signed 32-bit numbers, unless "&" follows. Raises 6 beyond the range of a
/// double.
[[nodiscard]] double leading_number(TextView text);

/// The standard text of a number: at most 15 significant digits (7 for a single), no thousands separators, no trailing
/// zeros; exponent form below 1E-04, from 1E+15 (1E+07) on, and if a fraction would need more than 15 (7) decimal
/// places.
[[nodiscard]] Text number_to_text(double value, const Locale& locale = {});
[[nodiscard]] Text number_to_text(float value, const Locale& locale = {});
[[nodiscard]] Text number_to_text(std::int32_t value);
[[nodiscard]] Text number_to_text(Currency value, const Locale& locale = {});

/// Converts a whole text to a number by automation's rules: accepts blanks around it, a sign before or after, thousands
/// separators, the currency symbol, brackets for a negative number, an exponent, &H and &O. Returns nothing if the text
/// is not a number. Raises 6 beyond the range of a double.
[[nodiscard]] std::optional<double> text_to_number(TextView text, const Locale& locale = {});

/// The same, exact to the ten-thousandth. Raises 6 beyond the range of a currency.
[[nodiscard]] std::optional<Currency> text_to_currency(TextView text, const Locale& locale = {});

/// The same as a whole number, halves rounded to even. &H and &O specify bits, so "&HFFFF" is -1 as a 16-bit number and
/// 65535 as a 32-bit one. Raises 6 if out of range.
template <std::signed_integral To>
[[nodiscard]] std::optional<To> text_to_integer(TextView text, const Locale& locale = {});

extern template std::optional<std::int16_t> text_to_integer(TextView text, const Locale& locale);
extern template std::optional<std::int32_t> text_to_integer(TextView text, const Locale& locale);

/// Converts a number to currency, halves rounded to even. Raises 6 if out of range.
[[nodiscard]] Currency number_to_currency(double value);

}  // namespace talutil
