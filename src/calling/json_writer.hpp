#pragma once

#include <array>
#include <charconv>
#include <concepts>
#include <string>
#include <string_view>

#include "automation/text.hpp"

/// Pieces of JSON, appended to a buffer.
namespace talutil::calling {

/// A text in quotes, in UTF-8. Control characters and lone surrogates are escaped, so that it is preserved completely.
void append_text(std::string& out, TextView text);

/// A text that needs no escapes: names of members and keys.
inline void append_name(std::string& out, std::string_view name) {
  out += '"';
  out += name;
  out += '"';
}

template <std::integral Number>
void append_number(std::string& out, Number value) {
  std::array<char, 32> digits{};
  const auto end = std::to_chars(digits.data(), digits.data() + digits.size(), value);
  out.append(digits.data(), end.ptr);
}

/// The shortest number that reads back as the same value. (The C++ library's own conversion needs large tables.)
void append_number(std::string& out, double value);
void append_number(std::string& out, float value);

}  // namespace talutil::calling
