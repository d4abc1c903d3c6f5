#pragma once

#include <array>
#include <string>

namespace talutil {

/// The powers of ten below 10^16, which a double holds exactly, as it does all whole numbers up to them.
inline constexpr std::array<double, 16> exact_powers_of_10{1,   1e1, 1e2,  1e3,  1e4,  1e5,  1e6,  1e7,
                                                           1e8, 1e9, 1e10, 1e11, 1e12, 1e13, 1e14, 1e15};

/// A number as decimal digits: 0.00125 is "125" with the exponent -3, that of its first digit.
struct DecimalDigits {
  std::string digits;  ///< Without zeros at the end.
  int exponent = 0;
};

/// The digits of a number, rounded to at most `count` of them; of two that are equally near, to the even one.
/// @param value finite and above 0
/// @param count 1 to 17
[[nodiscard]] DecimalDigits decimal_digits(double value, int count);

}  // namespace talutil
