#include "calling/json_reader.hpp"

#include <algorithm>
#include <array>

namespace talutil::calling {

namespace {

/// Deeper documents are refused, so that no input can exhaust the stack.
constexpr int deepest = 64;

constexpr bool is_digit(char c) noexcept { return c >= '0' && c <= '9'; }

/// Characters of a text that stand for themselves: ASCII, without control characters, quotes and backslashes.
constexpr auto plain_characters = [] {
  std::array<bool, 256> plain{};
  for (std::size_t c = 0x20; c < 0x80; ++c) plain[c] = c != '"' && c != '\\';
  return plain;
}();

constexpr bool is_plain(char c) noexcept { return plain_characters[static_cast<unsigned char>(c)]; }

/// A multi-byte sequence of UTF-8: its length, the bits of its first byte and the lowest code that needs that length.
struct Sequence {
  std::size_t length = 0;
  char32_t bits = 0;
  char32_t lowest = 0;
};

constexpr Sequence sequence_of(unsigned char first) noexcept {
  if ((first & 0xE0) == 0xC0) return {2, first & 0x1FU, 0x80};
  if ((first & 0xF0) == 0xE0) return {3, first & 0x0FU, 0x800};
  if ((first & 0xF8) == 0xF0) return {4, first & 0x07U, 0x10000};
  return {};
}

}  // namespace

void JsonReader::fail(const std::string& expected) const {
  throw JsonError("byte " + std::to_string(at_ + 1) + ": expected " + expected +
                  (at_ >= bytes_.size() ? ", but the line ends" : ""));
}

void JsonReader::skip_white_space() noexcept {
  while (at_ < bytes_.size() &&
         (bytes_[at_] == ' ' || bytes_[at_] == '\t' || bytes_[at_] == '\r' || bytes_[at_] == '\n')) {
    ++at_;
  }
}

/// The first character of what comes next; NUL, which is nothing in JSON, at the end.
char JsonReader::next_character() {
  skip_white_space();
  return at_ < bytes_.size() ? bytes_[at_] : '\0';
}

void JsonReader::take(char expected, const char* name) {
  if (next_character() != expected) fail(name);
  ++at_;
}

void JsonReader::take_word(std::string_view word) {
  skip_white_space();
  if (bytes_.substr(at_, word.size()) != word) fail(std::string(word));
  at_ += word.size();
  is_first_ = false;
}

JsonReader::Kind JsonReader::kind() {
  const char next = next_character();
  switch (next) {
    case '{':
      return Kind::object;
    case '[':
      return Kind::array;
    case '"':
      return Kind::text;
    case 't':
    case 'f':
      return Kind::truth;
    case 'n':
      return Kind::null;
    default:
      if (next == '-' || is_digit(next)) return Kind::number;
      fail("a value: an object, an array, a text in quotes, a number, true, false or null");
  }
}

void JsonReader::begin_object() {
  take('{', "an object");
  is_first_ = true;
}

bool JsonReader::next_key(Text& key) {
  if (next_character() == '}') {
    ++at_;
    is_first_ = false;
    return false;
  }
  if (!is_first_) take(',', "a comma or \"}\"");
  if (next_character() != '"') fail("a key in quotes");
  read_text(key);
  take(':', "a colon");
  return true;
}

void JsonReader::begin_array() {
  take('[', "an array");
  is_first_ = true;
}

bool JsonReader::next_element() {
  if (next_character() == ']') {
    ++at_;
    is_first_ = false;
    return false;
  }
  if (!is_first_) take(',', "a comma or \"]\"");
  is_first_ = false;
  return true;
}

void JsonReader::read_text(Text& text) {
  take('"', "a text in quotes");
  is_first_ = false;
  text.clear();
  while (true) {
    const std::size_t start = at_;
    while (at_ < bytes_.size() && is_plain(bytes_[at_])) ++at_;
    text.append(bytes_.begin() + static_cast<std::ptrdiff_t>(start), bytes_.begin() + static_cast<std::ptrdiff_t>(at_));
    if (at_ == bytes_.size()) fail("a closing quote");
    if (bytes_[at_] == '"') break;
    if (bytes_[at_] == '\\') {
      ++at_;
      read_escape(text);
    } else if (static_cast<unsigned char>(bytes_[at_]) < 0x80) {
      fail("no bare control character in a text; write \\u followed by its four hexadecimal digits");
    } else {
      read_wide(text);
    }
  }
  ++at_;
}

void JsonReader::read_escape(Text& text) {
  constexpr std::string_view names = "\"\\/bfnrt";
  constexpr std::u16string_view units = u"\"\\/\b\f\n\r\t";
  const char name = at_ < bytes_.size() ? bytes_[at_] : '\0';
  if (name == 'u') {
    ++at_;
    // A pair of surrogates becomes a character by standing together.
    text += read_unit();
    return;
  }
  const std::size_t found = name == '\0' ? std::string_view::npos : names.find(name);
  if (found == std::string_view::npos) fail("an escape: one of \" \\ / b f n r t u after the backslash");
  text += units[found];
  ++at_;
}

char16_t JsonReader::read_unit() {
  unsigned unit = 0;
  for (int i = 0; i < 4; ++i, ++at_) {
    const char c = at_ < bytes_.size() ? bytes_[at_] : '\0';
    const char folded = static_cast<char>(c | 0x20);
    if (is_digit(c))
      unit = unit * 16 + static_cast<unsigned>(c - '0');
    else if (folded >= 'a' && folded <= 'f')
      unit = unit * 16 + static_cast<unsigned>(folded - 'a' + 10);
    else
      fail("four hexadecimal digits after \\u");
  }
  return static_cast<char16_t>(unit);
}

void JsonReader::read_wide(Text& text) {
  const auto [length, bits, lowest] = sequence_of(static_cast<unsigned char>(bytes_[at_]));
  char32_t code = bits;
  bool is_valid = length != 0 && bytes_.size() - at_ >= length;
  for (std::size_t i = 1; is_valid && i < length; ++i) {
    const auto byte = static_cast<unsigned char>(bytes_[at_ + i]);
    is_valid = (byte & 0xC0) == 0x80;
    code = code << 6 | (byte & 0x3FU);
  }
  const bool is_surrogate = code >= 0xD800 && code <= 0xDFFF;
  if (!is_valid || code < lowest || code > 0x10FFFF || is_surrogate) fail("UTF-8");
  if (code >= 0x10000) {
    text += static_cast<char16_t>(0xD800 + ((code - 0x10000) >> 10));
    text += static_cast<char16_t>(0xDC00 + ((code - 0x10000) & 0x3FF));
  } else {
    text += static_cast<char16_t>(code);
  }
  at_ += length;
}

void JsonReader::take_digits() {
  if (at_ == bytes_.size() || !is_digit(bytes_[at_])) fail("a digit");
  while (at_ < bytes_.size() && is_digit(bytes_[at_])) ++at_;
}

std::string_view JsonReader::read_number() {
  skip_white_space();
  const std::size_t start = at_;
  const auto is_next = [this](char c) { return at_ < bytes_.size() && (bytes_[at_] | 0x20) == c; };
  if (at_ < bytes_.size() && bytes_[at_] == '-') ++at_;
  const std::size_t digits = at_;
  take_digits();
  if (bytes_[digits] == '0' && at_ - digits > 1) fail("no zero at the start of a number");
  if (at_ < bytes_.size() && bytes_[at_] == '.') {
    ++at_;
    take_digits();
  }
  if (is_next('e')) {
    ++at_;
    if (at_ < bytes_.size() && (bytes_[at_] == '+' || bytes_[at_] == '-')) ++at_;
    take_digits();
  }
  is_first_ = false;
  return bytes_.substr(start, at_ - start);
}

bool JsonReader::read_truth() {
  const bool is_true = next_character() == 't';
  take_word(is_true ? "true" : "false");
  return is_true;
}

void JsonReader::read_null() { take_word("null"); }

std::string_view JsonReader::skip_value() {
  skip_white_space();
  const std::size_t start = at_;
  skip_nested(0);
  return bytes_.substr(start, at_ - start);
}

void JsonReader::skip_nested(int depth) {
  if (depth > deepest) fail("at most " + std::to_string(deepest) + " values within each other");
  switch (kind()) {
    case Kind::object:
      begin_object();
      while (next_key(unused_)) skip_nested(depth + 1);
      break;
    case Kind::array:
      begin_array();
      while (next_element()) skip_nested(depth + 1);
      break;
    case Kind::text:
      read_text(unused_);
      break;
    case Kind::number:
      static_cast<void>(read_number());
      break;
    case Kind::truth:
      static_cast<void>(read_truth());
      break;
    case Kind::null:
      read_null();
      break;
  }
}

void JsonReader::end() {
  skip_white_space();
  if (at_ != bytes_.size()) fail("the end of the line");
}

}  // namespace talutil::calling
