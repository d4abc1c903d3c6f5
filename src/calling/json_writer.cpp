#include "calling/json_writer.hpp"

namespace talutil::calling {

namespace {

constexpr bool is_high_surrogate(char16_t unit) noexcept { return (unit & 0xFC00) == 0xD800; }
constexpr bool is_low_surrogate(char16_t unit) noexcept { return (unit & 0xFC00) == 0xDC00; }

/// Characters that stand for themselves in one byte.
constexpr bool is_plain(char16_t unit) noexcept {
  return unit >= u' ' && unit < u'\x7F' && unit != u'"' && unit != u'\\';
}

void append_escape(std::string& out, char16_t unit) {
  constexpr std::u16string_view units = u"\"\\\n\r\t";
  constexpr std::string_view names = "\"\\nrt";
  const std::size_t found = units.find(unit);
  out += '\\';
  if (found != std::u16string_view::npos) {
    out += names[found];
    return;
  }
  constexpr std::string_view digits = "0123456789abcdef";
  out += 'u';
  for (int shift = 12; shift >= 0; shift -= 4) out += digits[(unit >> shift) & 0xF];
}

void append_bytes(std::string& out, char32_t code) {
  const auto tail = [&](int shift) { out += static_cast<char>(0x80 | ((code >> shift) & 0x3F)); };
  if (code < 0x800) {
    out += static_cast<char>(0xC0 | (code >> 6));
  } else if (code < 0x10000) {
    out += static_cast<char>(0xE0 | (code >> 12));
    tail(6);
  } else {
    out += static_cast<char>(0xF0 | (code >> 18));
    tail(12);
    tail(6);
  }
  tail(0);
}

}  // namespace

void append_text(std::string& out, TextView text) {
  out += '"';
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char16_t unit = text[i];
    if (is_plain(unit)) {
      out += static_cast<char>(unit);
    } else if (is_high_surrogate(unit) && i + 1 < text.size() && is_low_surrogate(text[i + 1])) {
      append_bytes(out, 0x10000U + ((unit - 0xD800U) << 10) + (text[++i] - 0xDC00U));
    } else if (unit < 0x80 || is_high_surrogate(unit) || is_low_surrogate(unit)) {
      append_escape(out, unit);
    } else {
      append_bytes(out, unit);
    }
  }
  out += '"';
}

}  // namespace talutil::calling
