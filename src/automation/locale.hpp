#pragma once

#include <cstdint>

namespace talutil {

/// What conversions between numbers, dates and text take from their surroundings: the user's separators, and
/// the year that a date without one means. The order of dates does not depend on it: they are day first.
struct Locale {
  char16_t decimal_separator = u'.';
  char16_t thousands_separator = u',';
  char16_t currency_symbol = u'$';
  std::int32_t current_year = 2000;
};

}  // namespace talutil
