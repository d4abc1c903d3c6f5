#pragma once

#include <algorithm>
#include <array>
#include <cstdint>

#include "automation/text.hpp"

namespace talutil {

/// The environment of conversions between numbers, dates and text: the user's separators, and the year for dates
/// without one. The order of dates does not depend on it: day first.
struct Locale {
  char16_t decimal_separator = u'.';
  char16_t thousands_separator = u',';
  std::array<char16_t, 8> currency_symbol{u'$'};  ///< "$", "kr", "CHF", padded with zeros.
  std::int32_t current_year = 2000;

  [[nodiscard]] TextView currency() const noexcept {
    const TextView all(currency_symbol.data(), currency_symbol.size());
    return all.substr(0, all.find(u'\0'));
  }
  /// A symbol that is too long is ignored, because part of it would be a different symbol.
  void set_currency(TextView symbol) noexcept {
    if (symbol.empty() || symbol.size() > currency_symbol.size()) return;
    currency_symbol = {};
    std::copy(symbol.begin(), symbol.end(), currency_symbol.begin());
  }
};

/// Numbers as settings store them and leading_number reads them, for every user: with a full stop.
inline constexpr Locale plain_numbers{};

}  // namespace talutil
