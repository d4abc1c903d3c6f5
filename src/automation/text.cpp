#include "automation/text.hpp"

#include <algorithm>

namespace talutil {

namespace {

constexpr char32_t replacement = 0xFFFD;

constexpr bool is_high_surrogate(char32_t unit) noexcept { return unit >= 0xD800 && unit <= 0xDBFF; }
constexpr bool is_low_surrogate(char32_t unit) noexcept { return unit >= 0xDC00 && unit <= 0xDFFF; }

/// How many characters below 128 a text begins with. The inner loop is vectorised.
std::size_t ascii_length(TextView text) noexcept {
  constexpr std::size_t block_length = 16;
  std::size_t at = 0;
  for (; at + block_length <= text.size(); at += block_length) {
    char16_t all = 0;
    for (std::size_t i = 0; i < block_length; ++i) all |= text[at + i];
    if (all >= 0x80) break;
  }
  while (at < text.size() && text[at] < 0x80) ++at;
  return at;
}

void append_code_point(std::string& out, char32_t code) {
  const auto continuation = [code](int shift) { return static_cast<char>(0x80 | ((code >> shift) & 0x3F)); };
  if (code < 0x80) {
    out += static_cast<char>(code);
  } else if (code < 0x800) {
    out += static_cast<char>(0xC0 | (code >> 6));
    out += continuation(0);
  } else if (code < 0x10000) {
    out += static_cast<char>(0xE0 | (code >> 12));
    out += continuation(6);
    out += continuation(0);
  } else {
    out += static_cast<char>(0xF0 | (code >> 18));
    out += continuation(12);
    out += continuation(6);
    out += continuation(0);
  }
}

void append_code_point(Text& out, char32_t code) {
  if (code < 0x10000) {
    out += static_cast<char16_t>(code);
    return;
  }
  out += static_cast<char16_t>(0xD800 + ((code - 0x10000) >> 10));
  out += static_cast<char16_t>(0xDC00 + ((code - 0x10000) & 0x3FF));
}

struct Lead {
  std::size_t continuations;
  char32_t bits;
  char32_t lowest;  ///< Anything lower has a shorter form and is rejected.
};

constexpr Lead lead_of(unsigned char byte) noexcept {
  if (byte >= 0xC2 && byte <= 0xDF) return {1, byte & 0x1FU, 0x80};
  if (byte >= 0xE0 && byte <= 0xEF) return {2, byte & 0x0FU, 0x800};
  if (byte >= 0xF0 && byte <= 0xF4) return {3, byte & 0x07U, 0x10000};
  return {0, replacement, 0};
}

/// Reads one code point at `at` and moves past it, or past a single byte if that is invalid.
char32_t next_code(std::string_view bytes, std::size_t& at) noexcept {
  const auto first = static_cast<unsigned char>(bytes[at++]);
  if (first < 0x80) return first;
  const Lead lead = lead_of(first);
  if (lead.continuations == 0 || bytes.size() - at < lead.continuations) return replacement;
  char32_t code = lead.bits;
  for (std::size_t i = 0; i < lead.continuations; ++i) {
    const auto byte = static_cast<unsigned char>(bytes[at + i]);
    if ((byte & 0xC0) != 0x80) return replacement;
    code = (code << 6) | (byte & 0x3FU);
  }
  const bool is_surrogate = is_high_surrogate(code) || is_low_surrogate(code);
  if (code < lead.lowest || code > 0x10FFFF || is_surrogate) return replacement;
  at += lead.continuations;
  return code;
}

}  // namespace

std::size_t find_unit(TextView text, char16_t wanted, std::size_t from) noexcept {
  // Most blocks do not have it. The compiler vectorises the loop over a block, whose length it knows.
  constexpr std::size_t block_length = 32;
  for (; from + block_length <= text.size(); from += block_length) {
    const char16_t* const block = text.data() + from;
    char16_t matches = 0;
    for (std::size_t i = 0; i < block_length; ++i) matches |= static_cast<char16_t>(block[i] == wanted ? 1 : 0);
    if (matches != 0) break;
  }
  while (from < text.size() && text[from] != wanted) ++from;
  return std::min(from, text.size());
}

TextView up_to_nul(TextView text) noexcept { return text.substr(0, find_unit(text, u'\0')); }

TextView trim_blanks(TextView text) noexcept {
  const std::size_t first = text.find_first_not_of(u' ');
  if (first == TextView::npos) return {};
  return text.substr(first, text.find_last_not_of(u' ') - first + 1);
}

bool is_white_space(char16_t unit) noexcept {
  constexpr TextView others = u"\u00A0\u1680\u2028\u2029\u202F\u205F\u3000";
  if (unit <= u' ') return unit == u' ' || (unit >= u'\t' && unit <= u'\r');
  return unit == 0x85 || (unit >= 0x2000 && unit <= 0x200A) || others.find(unit) != TextView::npos;
}

void append_utf8(std::string& bytes, TextView text) {
  for (std::size_t i = 0; i < text.size(); ++i) {
    const std::size_t run = ascii_length(text.substr(i));
    const std::size_t start = bytes.size();
    bytes.resize(start + run);
    for (std::size_t k = 0; k < run; ++k) bytes[start + k] = static_cast<char>(text[i + k]);
    i += run;
    if (i == text.size()) return;
    char32_t code = text[i];
    if (is_high_surrogate(code) && i + 1 < text.size() && is_low_surrogate(text[i + 1])) {
      code = 0x10000 + ((code - 0xD800) << 10) + (text[++i] - 0xDC00U);
    } else if (is_high_surrogate(code) || is_low_surrogate(code)) {
      code = replacement;
    }
    append_code_point(bytes, code);
  }
}

std::string to_utf8(TextView text) {
  std::string bytes;
  bytes.reserve(text.size());
  append_utf8(bytes, text);
  return bytes;
}

Text from_utf8(std::string_view bytes) {
  Text out;
  out.reserve(bytes.size());
  for (std::size_t at = 0; at < bytes.size();) append_code_point(out, next_code(bytes, at));
  return out;
}

std::string to_utf16_bytes(TextView text) {
  std::string bytes(2 * text.size(), '\0');
  for (std::size_t i = 0; i < text.size(); ++i) {
    bytes[2 * i] = static_cast<char>(text[i]);
    bytes[2 * i + 1] = static_cast<char>(text[i] >> 8);
  }
  return bytes;
}

Text from_utf16_bytes(std::string_view bytes) {
  Text text(bytes.size() / 2, u'\0');
  for (std::size_t i = 0; i < text.size(); ++i) {
    text[i] = static_cast<char16_t>(static_cast<unsigned char>(bytes[2 * i]) |
                                    static_cast<unsigned char>(bytes[2 * i + 1]) << 8);
  }
  return text;
}

}  // namespace talutil
