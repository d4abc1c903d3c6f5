#pragma once

#include <concepts>
#include <cstdint>
#include <optional>

#include "automation/locale.hpp"
#include "automation/text.hpp"

namespace talutil {

/// Automation's currency: a whole number of ten-thousandths.
struct Currency {
  std::int64_t ten_thousandths = 0;
  friend constexpr bool operator==(Currency, Currency) noexcept = default;
};

/// The longest number at the start of a text, as the hosts' Val reads it; 0 where there is none. Blanks,
/// tabs and line breaks anywhere are skipped; a sign, digits, one full stop (whatever the locale), an
/// exponent after E or D, and the prefixes &H and &O are understood; reading stops at the first other
/// character. &H and &O numbers of up to 16 bits are signed 16-bit ones, longer ones signed 32-bit ones,
/// unless "&" follows. Raises 6 beyond the range of a double.
[[nodiscard]] double leading_number(TextView text);

/// Standard number-to-text form: at most 15 significant digits (7 for a single), no thousands separators,
/// no trailing zeros, exponent form below 1E-04, from 1E+15 (1E+07) on, and where a fraction would need more than 15
/// (7) decimal places.
[[nodiscard]] Text number_to_text(double value, const Locale& locale = {});
[[nodiscard]] Text number_to_text(float value, const Locale& locale = {});
[[nodiscard]] Text number_to_text(std::int32_t value);
[[nodiscard]] Text number_to_text(Currency value, const Locale& locale = {});

/// A whole text as a number, as automation converts it: blanks around it, a sign before or after, thousands
/// separators, the currency symbol, brackets for a negative number, an exponent, &H and &O are accepted.
/// Empty when the text is no number. Raises 6 beyond the range of a double.
[[nodiscard]] std::optional<double> text_to_number(TextView text, const Locale& locale = {});

/// The same, exact to the ten-thousandth. Raises 6 beyond the range of a currency.
[[nodiscard]] std::optional<Currency> text_to_currency(TextView text, const Locale& locale = {});

/// The same as a whole number, halves to even. &H and &O give the bits, so "&HFFFF" is -1 as a 16-bit number
/// and 65535 as a 32-bit one. Raises 6 out of range.
template <std::signed_integral To>
[[nodiscard]] std::optional<To> text_to_integer(TextView text, const Locale& locale = {});

extern template std::optional<std::int16_t> text_to_integer(TextView text, const Locale& locale);
extern template std::optional<std::int32_t> text_to_integer(TextView text, const Locale& locale);

/// A number as currency, halves to even. Raises 6 out of range.
[[nodiscard]] Currency number_to_currency(double value);

}  // namespace talutil
