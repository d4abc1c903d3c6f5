#include "cli/encoding.hpp"

#include <algorithm>
#include <charconv>

#include "cli/failure.hpp"
#include "platform/posix/posix_code_page.hpp"

namespace talutil::cli {

namespace {

using Kind = Encoding::Kind;

constexpr std::string_view utf8_mark = "\xEF\xBB\xBF";
constexpr std::string_view low_first_mark = "\xFF\xFE";
constexpr std::string_view high_first_mark = "\xFE\xFF";
constexpr std::uint32_t utf8_page = 65001;

constexpr bool is_ascii_byte(char c) noexcept { return static_cast<unsigned char>(c) < 0x80; }

/// The length of the character that bytes begin with; 0 if they are no UTF-8, more than there are if they end early.
std::size_t character_length(std::string_view bytes, char32_t& code) {
  const auto at = [&](std::size_t i) { return static_cast<unsigned char>(bytes[i]); };
  const unsigned first = at(0);
  const std::size_t length = first < 0x80   ? 1
                             : first < 0xC2 ? 0
                             : first < 0xE0 ? 2
                             : first < 0xF0 ? 3
                             : first < 0xF5 ? 4
                                            : 0;
  if (length < 2) {
    code = first;
    return length;
  }
  code = first & (0xFFU >> (length + 1));
  for (std::size_t i = 1; i < std::min(length, bytes.size()); ++i) {
    if ((at(i) & 0xC0U) != 0x80U) return 0;
    code = code << 6U | (at(i) & 0x3FU);
  }
  if (bytes.size() < length) return length;
  constexpr std::array<char32_t, 5> least{0, 0, 0x80, 0x800, 0x10000};
  const bool is_surrogate = code >= 0xD800 && code < 0xE000;
  return code < least[length] || code > 0x10FFFF || is_surrogate ? 0 : length;
}

void append_character(Text& text, char32_t code) {
  if (code < 0x10000) {
    text += static_cast<char16_t>(code);
    return;
  }
  text += static_cast<char16_t>(0xD7C0 + (code >> 10U));
  text += static_cast<char16_t>(0xDC00 + (code & 0x3FFU));
}

/// Whether bytes without a mark look like Latin text in UTF-16: a NUL in every other of the first ones.
std::optional<Kind> guessed_utf16(std::string_view bytes) {
  constexpr std::size_t most = 64;
  bytes = bytes.substr(0, std::min(most, bytes.size()) & ~std::size_t{1});
  std::size_t nuls[2] = {0, 0};
  for (std::size_t i = 0; i < bytes.size(); ++i) nuls[i % 2] += bytes[i] == '\0' ? 1 : 0;
  const std::size_t half = bytes.size() / 2;
  if (half < 2) return std::nullopt;
  if (nuls[1] == half && nuls[0] == 0) return Kind::utf16_low_first;
  if (nuls[0] == half && nuls[1] == 0) return Kind::utf16_high_first;
  return std::nullopt;
}

}  // namespace

Encoding encoding_named(const std::string& name, const std::string& option) {
  std::string plain;
  for (const char c : name) {
    if (c != '-') plain += static_cast<char>(c >= 'A' && c <= 'Z' ? c - 'A' + 'a' : c);
  }
  if (plain == "utf8") return {Kind::utf8, 0};
  if (plain == "utf16" || plain == "utf16le") return {Kind::utf16_low_first, 0};
  if (plain == "utf16be") return {Kind::utf16_high_first, 0};
  std::uint32_t number = 0;
  const auto [end, status] = std::from_chars(plain.data(), plain.data() + plain.size(), number);
  const auto known = posix::code_page_numbers();
  if (status == std::errc() && end == plain.data() + plain.size() && std::ranges::count(known, number) > 0) {
    return number == utf8_page ? Encoding{Kind::utf8, 0} : Encoding{Kind::page, number};
  }
  std::string numbers;
  for (const std::uint32_t page : known) numbers += ", " + std::to_string(page);
  throw usage_failure(option + " " + name + ": there is no such encoding; there are utf-8, utf-16" + numbers);
}

Decoder::Decoder(std::string source, const InputEncoding& encoding) : source_(std::move(source)), wanted_(encoding) {
  if (wanted_.name.empty()) return;
  encoding_ = encoding_named(wanted_.name, "--encoding");
  is_certain_ = true;
}

/// Decides by the first bytes.
void Decoder::begin(std::string_view bytes) {
  has_begun_ = true;
  const bool may_change = !is_certain_;
  const auto has = [&](std::string_view mark, Kind kind) {
    if (!bytes.starts_with(mark) || (!may_change && encoding_.kind != kind)) return false;
    encoding_.kind = kind;
    is_certain_ = true;
    return true;
  };
  // A mark is read over even where the encoding is named.
  if (has(utf8_mark, Kind::utf8) || has(low_first_mark, Kind::utf16_low_first) ||
      has(high_first_mark, Kind::utf16_high_first)) {
    return;
  }
  if (const auto guess = may_change ? guessed_utf16(bytes) : std::nullopt) {
    encoding_.kind = *guess;
    is_certain_ = true;
    warn(source_ + ": read as UTF-16 (without a mark); --encoding names another encoding");
  }
  if (encoding_.kind == Kind::page) {
    page_ = posix::make_code_page(encoding_.page);
    make_table();
  }
}

void Decoder::make_table() {
  constexpr std::array<std::uint32_t, 4> double_byte{932, 936, 949, 950};
  has_table_ = std::ranges::count(double_byte, encoding_.page) == 0;
  for (std::size_t code = 0; has_table_ && code < table_.size(); ++code) {
    const char byte = static_cast<char>(code);
    const Text text = page_->text_of({&byte, 1});
    table_[code] = text.empty() ? u'\uFFFD' : text.front();
  }
}

std::string Decoder::line_of(std::string_view bytes_before) const {
  return "line " + std::to_string(lines_ + 1 + static_cast<std::uint64_t>(std::ranges::count(bytes_before, '\n')));
}

/// Falls back to the code page at the first character that is no UTF-8.
void Decoder::use_page(std::string_view bytes_before) {
  const std::string place = line_of(bytes_before);
  if (is_certain_) throw run_time_failure(place + " is not in UTF-8; --encoding names another encoding");
  if (has_wide_) {
    throw run_time_failure(place + " is not in UTF-8, although lines before it are; mend it, or name the encoding by " +
                           "--encoding");
  }
  encoding_ = {Kind::page, wanted_.page.value_or(posix::chosen_code_page())};
  if (encoding_.page == utf8_page) throw run_time_failure(place + " is not in UTF-8; name the encoding by --encoding");
  if (!wanted_.page) {
    warn(source_ + ": " + place + " is not in UTF-8; read as code page " + std::to_string(encoding_.page) +
         " (--encoding names another encoding)");
  }
  page_ = posix::make_code_page(encoding_.page);
  make_table();
  is_certain_ = true;
}

std::size_t Decoder::decode_utf8(std::string_view bytes, bool is_last, Text& text) {
  std::size_t at = 0;
  while (at < bytes.size()) {
    std::size_t end = at;
    while (end < bytes.size() && is_ascii_byte(bytes[end])) ++end;
    const std::size_t start = text.size();
    text.resize(start + end - at);
    std::copy(bytes.begin() + static_cast<std::ptrdiff_t>(at), bytes.begin() + static_cast<std::ptrdiff_t>(end),
              text.begin() + static_cast<std::ptrdiff_t>(start));
    at = end;
    if (at == bytes.size()) break;
    char32_t code = 0;
    const std::size_t length = character_length(bytes.substr(at), code);
    if (length != 0 && at + length > bytes.size() && !is_last) return at;
    if (length == 0 || at + length > bytes.size()) {
      use_page(bytes.substr(0, at));
      return at + decode_page(bytes.substr(at), is_last, text);
    }
    has_wide_ = true;
    append_character(text, code);
    at += length;
  }
  return at;
}

std::size_t Decoder::decode_utf16(std::string_view bytes, bool is_last, Text& text) const {
  if (is_last && bytes.size() % 2 != 0) throw run_time_failure("is cut off: UTF-16 has two bytes a unit");
  const std::size_t low = encoding_.kind == Kind::utf16_low_first ? 0 : 1;
  const std::size_t whole = bytes.size() & ~std::size_t{1};
  for (std::size_t i = 0; i < whole; i += 2) {
    text += static_cast<char16_t>(static_cast<unsigned char>(bytes[i + low]) |
                                  static_cast<unsigned char>(bytes[i + 1 - low]) << 8U);
  }
  return whole;
}

std::size_t Decoder::decode_page(std::string_view bytes, bool is_last, Text& text) {
  if (has_table_) {
    for (const char c : bytes) text += table_[static_cast<unsigned char>(c)];
    return bytes.size();
  }
  // No byte below 64 is the second of a character.
  const auto ends = [](char c) { return static_cast<unsigned char>(c) < 64; };
  const auto last = std::find_if(bytes.rbegin(), bytes.rend(), ends);
  const std::size_t whole = is_last ? bytes.size() : static_cast<std::size_t>(bytes.rend() - last);
  page_->append_text(text, bytes.substr(0, whole));
  return whole;
}

void Decoder::decode(std::string_view bytes, bool is_last, Text& text) {
  constexpr std::size_t enough_to_begin = 64;
  if (!waiting_.empty()) bytes = waiting_ += bytes;
  std::size_t done = 0;
  if (!has_begun_ && (bytes.size() >= enough_to_begin || is_last)) {
    begin(bytes);
    if (encoding_.kind == Kind::utf8 && bytes.starts_with(utf8_mark)) done = utf8_mark.size();
    if (encoding_.kind == Kind::utf16_low_first && bytes.starts_with(low_first_mark)) done = 2;
    if (encoding_.kind == Kind::utf16_high_first && bytes.starts_with(high_first_mark)) done = 2;
  }
  if (has_begun_) {
    const std::string_view rest = bytes.substr(done);
    text.reserve(text.size() + rest.size());
    done += encoding_.kind == Kind::utf8   ? decode_utf8(rest, is_last, text)
            : encoding_.kind == Kind::page ? decode_page(rest, is_last, text)
                                           : decode_utf16(rest, is_last, text);
    lines_ += static_cast<std::uint64_t>(std::ranges::count(bytes.substr(0, done), '\n'));
  }
  waiting_ = std::string(bytes.substr(done));
}

Encoder::Encoder(Encoding encoding) : encoding_(encoding) {
  if (encoding_.kind == Kind::page) page_ = posix::make_code_page(encoding_.page);
}

std::string_view Encoder::mark() const noexcept {
  return encoding_.kind == Kind::utf16_low_first    ? low_first_mark
         : encoding_.kind == Kind::utf16_high_first ? high_first_mark
                                                    : std::string_view();
}

void Encoder::append(std::string& bytes, TextView text) {
  switch (encoding_.kind) {
    case Kind::utf16_low_first:
      bytes += to_utf16_bytes(text);
      return;
    case Kind::utf16_high_first:
      for (const char16_t unit : text) {
        bytes += static_cast<char>(unit >> 8U);
        bytes += static_cast<char>(unit & 0xFFU);
      }
      return;
    default:
      break;
  }
  if (!page_ || is_ascii(text)) {
    append_utf8(bytes, text);
  } else {
    for (const char16_t unit : text) append_code(bytes, unit);
  }
}

void Encoder::append_code(std::string& bytes, char16_t unit) {
  constexpr std::size_t all_units = 0x10000;
  if (is_held_.empty()) is_held_.resize(all_units);
  if (!is_held_[unit] && !is_lossy_) {
    is_held_[unit] = page_->holds(TextView(&unit, 1));
    is_lossy_ = !is_held_[unit];
  }
  const std::uint32_t code = page_->code(unit);
  if (code > 0xFF) bytes += static_cast<char>(code >> 8U);
  bytes += static_cast<char>(code & 0xFFU);
}

Text read_text(const std::string& path, const InputEncoding& encoding) {
  Input input(path);
  Decoder decoder(shown_input(path), encoding);
  Text text;
  std::string buffer(1U << 18U, '\0');
  for (;;) {
    const std::size_t count = input.read(buffer);
    within(shown_input(path), [&] { decoder.decode(std::string_view(buffer).substr(0, count), count == 0, text); });
    if (count == 0) return text;
  }
}

}  // namespace talutil::cli
