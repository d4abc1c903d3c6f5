#pragma once

#include <algorithm>
#include <array>
#include <cstdint>

#include "automation/text.hpp"

namespace talutil {

/// What conversions between numbers, dates and text take from their surroundings: the user's separators, and
/// the year that a date without one means. The order of dates does not depend on it: they are day first.
struct Locale {
  char16_t decimal_separator = u'.';
  char16_t thousands_separator = u',';
  std::array<char16_t, 8> currency_symbol{u'$'};  ///< "$", "kr", "CHF"; zeros behind it.
  std::int32_t current_year = 2000;

  [[nodiscard]] TextView currency() const noexcept {
    const TextView all(currency_symbol.data(), currency_symbol.size());
    return all.substr(0, all.find(u'\0'));
  }
  /// One that is too long for its place stays what it is: a part of it would be another symbol.
  void set_currency(TextView symbol) noexcept {
    if (symbol.empty() || symbol.size() > currency_symbol.size()) return;
    currency_symbol = {};
    std::copy(symbol.begin(), symbol.end(), currency_symbol.begin());
  }
};

/// Numbers as settings keep them and as leading_number reads them, whoever the user is: with a full stop.
inline constexpr Locale plain_numbers{};

}  // namespace talutil
