#pragma once

#include <cstdint>

#include "platform/code_page.hpp"

namespace talutil {

constexpr TextView line_break = u"\r\n";

/// True for the codes of 0 to 9, which some pages also assign to characters they lack.
[[nodiscard]] constexpr bool is_digit_code(std::uint32_t code) noexcept { return code >= u'0' && code <= u'9'; }

/// A test of a character by its code.
template <class Test>
[[nodiscard]] auto by_code(CodePage& page, Test test) {
  return [&page, test](char16_t unit) { return test(page.code(unit)); };
}

}  // namespace talutil
