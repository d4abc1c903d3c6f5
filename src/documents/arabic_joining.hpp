#pragma once

#include "automation/text.hpp"

namespace talutil {

/// Whether the form of a character may depend on its neighbours.
[[nodiscard]] constexpr bool is_joining(char16_t unit) noexcept {
  return (unit >= 0x0600 && unit < 0x0700) || unit == 0x200D;
}

/// A text with its Arabic letters as presentation forms, joined to their neighbours, and each lam before an alef made
/// one ligature with it. The order stays as it is. Letters without such forms do not join.
[[nodiscard]] Text joined(TextView text);

/// The letter that a presentation form stands for; any other character, and a ligature, as it is.
[[nodiscard]] char16_t letter_of_form(char16_t form);

}  // namespace talutil
