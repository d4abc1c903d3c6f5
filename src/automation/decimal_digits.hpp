#pragma once

#include <string>

namespace talutil {

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
