#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace talutil {

/// UTF-16 text with a length, automation's string type. Empty and missing are the same.
using Text = std::u16string;
using TextView = std::u16string_view;

/// Removes blanks (code 32) at both ends. Tabs, line breaks and no-break spaces stay, as with the hosts' Trim.
[[nodiscard]] TextView trim_blanks(TextView text) noexcept;

/// The text before its first NUL, as a C string of the platform would hold it.
[[nodiscard]] TextView up_to_nul(TextView text) noexcept;

/// The index of a code unit at or after `from`; the text's size if there is none. In long texts, many times as fast as
/// the standard library's search.
[[nodiscard]] std::size_t find_unit(TextView text, char16_t wanted, std::size_t from = 0) noexcept;

/// Blanks, tabs, line breaks and similar characters beyond ASCII, which conversions from text skip at both ends.
[[nodiscard]] bool is_white_space(char16_t unit) noexcept;

[[nodiscard]] constexpr bool is_decimal_digit(char16_t unit) noexcept { return unit >= u'0' && unit <= u'9'; }

/// Compares code unit by code unit, ignoring the case of letters.
[[nodiscard]] bool equals_without_case(TextView a, TextView b) noexcept;

/// The byte of a code unit in code page 1252 (0 to 255), with the page's best fit for characters it lacks (U+0100
/// becomes "A") and otherwise 63, the question mark. From the platform's own conversion, see ansi_code_page.cpp.
/// Members compare characters by the platform's page instead (platform/code_page.hpp).
[[nodiscard]] std::uint8_t ansi_code(char16_t unit) noexcept;

/// Whether every character is below 128.
[[nodiscard]] bool is_ascii(TextView text) noexcept;

/// The one-character text of a code in code page 1252, 0 to 255. Raises 5 outside that range.
[[nodiscard]] Text chr(std::int32_t code);

/// Conversion to bytes in code page 1252 and back. Every code unit becomes one byte.
[[nodiscard]] std::string to_ansi(TextView text);
[[nodiscard]] Text from_ansi(std::string_view bytes);
void append_ansi(Text& text, std::string_view bytes);

/// Writes a unit for each byte, if all are ASCII. Otherwise returns false, and what was written has no meaning.
[[nodiscard]] bool widen_ascii(std::string_view bytes, char16_t* units) noexcept;

/// Upper and lower case, code unit by code unit, from the platform's table (no locale and no one-to-many mappings: the
/// sharp s stays). See letter_case.cpp.
[[nodiscard]] char16_t upper_case(char16_t unit) noexcept;
[[nodiscard]] char16_t lower_case(char16_t unit) noexcept;
[[nodiscard]] Text upper_case(TextView text);
[[nodiscard]] Text lower_case(TextView text);

/// UTF-8 for our command line, logs and messages. Lone surrogates and invalid bytes become U+FFFD.
[[nodiscard]] std::string to_utf8(TextView text);
void append_utf8(std::string& bytes, TextView text);
[[nodiscard]] Text from_utf8(std::string_view bytes);

/// Conversion of code units to bytes, low byte first, and back; an odd byte at the end is ignored.
[[nodiscard]] std::string to_utf16_bytes(TextView text);
[[nodiscard]] Text from_utf16_bytes(std::string_view bytes);

}  // namespace talutil
