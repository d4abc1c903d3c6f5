#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace talutil {

/// Counted UTF-16 text, the wide string of automation. Empty and missing are the same.
using Text = std::u16string;
using TextView = std::u16string_view;

/// Removes blanks (code 32) at both ends. Tabs, line breaks and no-break blanks stay, as in the hosts' Trim.
[[nodiscard]] TextView trim_blanks(TextView text) noexcept;

/// The text before its first NUL: what a platform's C string would hold.
[[nodiscard]] TextView up_to_nul(TextView text) noexcept;

/// Blanks, tabs, line breaks and their relatives beyond ASCII: what conversions from text skip at the ends.
[[nodiscard]] bool is_white_space(char16_t unit) noexcept;

[[nodiscard]] constexpr bool is_decimal_digit(char16_t unit) noexcept { return unit >= u'0' && unit <= u'9'; }

/// Equal but for the case of letters, code unit by code unit.
[[nodiscard]] bool equals_without_case(TextView a, TextView b) noexcept;

/// The byte of one code unit in code page 1252 (0 to 255), with the code page's best fit for characters it does
/// not hold (U+0100 counts as "A") and 63, the question mark, where there is none. Source: the platform's own
/// conversion, see ansi_code_page.cpp. Members compare characters by the platform's page (platform/code_page.hpp).
[[nodiscard]] std::uint8_t ansi_code(char16_t unit) noexcept;

/// Whether every character is below 128.
[[nodiscard]] bool is_ascii(TextView text) noexcept;

/// The one-character text of a code of code page 1252, 0 to 255. Raises 5 outside that range.
[[nodiscard]] Text chr(std::int32_t code);

/// The bytes of a text in code page 1252, and back. Every code unit becomes one byte.
[[nodiscard]] std::string to_ansi(TextView text);
[[nodiscard]] Text from_ansi(std::string_view bytes);
void append_ansi(Text& text, std::string_view bytes);

/// Upper and lower case, code unit by code unit, by the platform's own table (no locale, no one-to-many
/// mappings: the sharp s stays). Source: see letter_case.cpp.
[[nodiscard]] char16_t upper_case(char16_t unit) noexcept;
[[nodiscard]] char16_t lower_case(char16_t unit) noexcept;
[[nodiscard]] Text upper_case(TextView text);
[[nodiscard]] Text lower_case(TextView text);

/// UTF-8 for the command line, logs and messages of our own. Lone surrogates and bad bytes become U+FFFD.
[[nodiscard]] std::string to_utf8(TextView text);
[[nodiscard]] Text from_utf8(std::string_view bytes);

/// The code units of a text as bytes, low byte first, and back; an odd byte at the end does not count.
[[nodiscard]] std::string to_utf16_bytes(TextView text);
[[nodiscard]] Text from_utf16_bytes(std::string_view bytes);

}  // namespace talutil
