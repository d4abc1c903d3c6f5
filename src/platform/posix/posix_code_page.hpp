#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "platform/code_page.hpp"

namespace talutil::posix {

/// The numbers of the code pages there are.
[[nodiscard]] std::vector<std::uint32_t> code_page_numbers();

/// The number in TALUTIL_CODE_PAGE; 1252 where that is not set. Throws std::runtime_error for one that there is no page
/// of.
[[nodiscard]] std::uint32_t chosen_code_page();

/// 1252 is the table of our own. The others are the C library's: it knows no best fit, so what a page does not hold is
/// "?" (U+FFFD in UTF-8), and so are bytes that are no character U+FFFD. Throws std::runtime_error for an unknown page,
/// and where the machine lacks the C library's table of it.
[[nodiscard]] std::unique_ptr<CodePage> make_code_page(std::uint32_t number);

}  // namespace talutil::posix
