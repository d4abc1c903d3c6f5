#pragma once

#include <concepts>
#include <cstdint>
#include <limits>

#include "automation/run_time_error.hpp"

namespace talutil {

/// Arithmetic on interface integers: every overflow raises 6; numbers never wrap.
template <std::signed_integral T>
[[nodiscard]] constexpr T checked_add(T a, T b) {
  T result{};
  if (__builtin_add_overflow(a, b, &result)) raise(ErrorNumber::overflow);
  return result;
}

template <std::signed_integral T>
[[nodiscard]] constexpr T checked_subtract(T a, T b) {
  T result{};
  if (__builtin_sub_overflow(a, b, &result)) raise(ErrorNumber::overflow);
  return result;
}

template <std::signed_integral T>
[[nodiscard]] constexpr T checked_multiply(T a, T b) {
  T result{};
  if (__builtin_mul_overflow(a, b, &result)) raise(ErrorNumber::overflow);
  return result;
}

/// Converts a whole number to 16 or 32 bits; raises 6 if it is out of range.
template <std::signed_integral To, std::integral From>
[[nodiscard]] constexpr To checked_cast(From value) {
  To result{};
  if (__builtin_add_overflow(value, From{0}, &result)) raise(ErrorNumber::overflow);
  return result;
}

/// Rounds to the nearest whole number, halves to even; raises 6 if it is out of range, infinite or not a number.
template <std::signed_integral To>
[[nodiscard]] To round_to(double value);

extern template std::int16_t round_to<std::int16_t>(double);
extern template std::int32_t round_to<std::int32_t>(double);

/// The longest text that members with a 16-bit loop index accept; a longer one raises 6.
constexpr std::size_t longest_16_bit_length = 32767;

constexpr void require_16_bit_length(std::size_t length) {
  if (length > longest_16_bit_length) raise(ErrorNumber::overflow);
}

}  // namespace talutil
