#pragma once

#include <cstdint>
#include <memory>
#include <vector>

#include "platform/code_page.hpp"

namespace talutil::posix {

/// The numbers of the supported code pages.
[[nodiscard]] std::vector<std::uint32_t> code_page_numbers();

/// The number in TALUTIL_CODE_PAGE; 1252 if that is not set. Throws std::runtime_error if there is no such page.
[[nodiscard]] std::uint32_t chosen_code_page();

/// Creates a code page: 1252 from our own table, others from the C library. The latter has no best fit, so a character
/// that the page lacks becomes "?" (U+FFFD in UTF-8), and bytes that are not a character become U+FFFD. Throws
/// std::runtime_error for an unknown page, and if the C library's table of it is not installed.
[[nodiscard]] std::unique_ptr<CodePage> make_code_page(std::uint32_t number);

}  // namespace talutil::posix
