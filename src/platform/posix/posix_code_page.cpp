#include "platform/posix/posix_code_page.hpp"

#include <iconv.h>

#include <algorithm>
#include <array>
#include <charconv>
#include <optional>
#include <stdexcept>

#include "platform/posix/data_folder.hpp"

namespace talutil::posix {

namespace {

struct PageRow {
  std::uint32_t number;
  const char* name;  ///< The C library's name for it.
  std::size_t longest_character;
};

constexpr std::uint32_t western = 1252;
constexpr const char* variable = "TALUTIL_CODE_PAGE";

constexpr PageRow rows[] = {
    {874, "CP874", 1},   {932, "CP932", 2},   {936, "CP936", 2},   {949, "CP949", 2},   {950, "CP950", 2},
    {1250, "CP1250", 1}, {1251, "CP1251", 1}, {western, "", 1},    {1253, "CP1253", 1}, {1254, "CP1254", 1},
    {1255, "CP1255", 1}, {1256, "CP1256", 1}, {1257, "CP1257", 1}, {1258, "CP1258", 1}, {65001, "UTF-8", 4},
};

std::runtime_error unknown_page(const std::string& written) {
  std::string numbers;
  for (const PageRow& row : rows) numbers += (numbers.empty() ? "" : ", ") + std::to_string(row.number);
  return std::runtime_error(written + " is no code page that there is; choose one of " + numbers);
}

struct CloseConverter {
  void operator()(void* converter) const noexcept { iconv_close(converter); }
};

/// Converts one character at a time from one encoding to another.
class Converter {
 public:
  Converter(const char* to, const char* from) {
    const iconv_t opened = iconv_open(to, from);
    // NOLINTNEXTLINE(performance-no-int-to-ptr,cppcoreguidelines-pro-type-cstyle-cast): how iconv reports failure.
    if (opened == (iconv_t)-1) {
      throw std::runtime_error(std::string("the C library has no conversion from ") + from + " to " + to +
                               "; install its character sets (gconv modules)");
    }
    handle_.reset(opened);
  }

  /// Returns nothing if the bytes are not whole characters, or the target encoding lacks them.
  [[nodiscard]] std::optional<std::string> convert(std::string character) const {
    std::array<char, 16> converted{};
    char* from = character.data();
    std::size_t left = character.size();
    char* end = converted.data();
    std::size_t room = converted.size();
    // Each character starts from the initial state, whatever the one before left behind.
    iconv(handle_.get(), nullptr, nullptr, nullptr, nullptr);
    if (iconv(handle_.get(), &from, &left, &end, &room) == failed) return std::nullopt;
    // Pages 1255 and 1258 hold back a letter in case a combining mark follows.
    if (iconv(handle_.get(), nullptr, nullptr, &end, &room) == failed) return std::nullopt;
    return std::string(converted.data(), end);
  }

 private:
  static constexpr auto failed = static_cast<std::size_t>(-1);
  std::unique_ptr<void, CloseConverter> handle_;
};

bool is_pair(TextView text) noexcept {
  return text.size() >= 2 && (text[0] & 0xFC00) == 0xD800 && (text[1] & 0xFC00) == 0xDC00;
}

class LibraryCodePage final : public CodePage {
 public:
  explicit LibraryCodePage(const PageRow& row)
      : to_page_(row.name, wide),
        from_page_(wide, row.name),
        longest_character_(row.longest_character),
        substitute_(to_page_.convert(to_utf16_bytes(u"\uFFFD")).value_or("?")) {}

  [[nodiscard]] std::string bytes_of(TextView text) override {
    std::string bytes;
    bytes.reserve(text.size());
    while (!text.empty()) {
      const TextView character = text.substr(0, is_pair(text) ? 2 : 1);
      append(bytes, character);
      text.remove_prefix(character.size());
    }
    return bytes;
  }

  [[nodiscard]] Text text_of(std::string_view bytes) override {
    Text text;
    text.reserve(bytes.size());
    while (!bytes.empty()) bytes.remove_prefix(append_character(text, bytes));
    return text;
  }

 private:
  static constexpr const char* wide = "UTF-16LE";

  void append(std::string& bytes, TextView character) const {
    const auto converted = to_page_.convert(to_utf16_bytes(character));
    // A letter that the page can only spell as letter plus mark does not count as one of its characters.
    if (converted && converted->size() <= longest_character_) {
      bytes += *converted;
    } else {
      for (std::size_t i = 0; i < character.size(); ++i) bytes += substitute_;
    }
  }

  /// Appends the first character of the bytes; returns its length, 1 for a byte that does not begin a character.
  [[nodiscard]] std::size_t append_character(Text& text, std::string_view bytes) const {
    for (std::size_t length = 1; length <= std::min(longest_character_, bytes.size()); ++length) {
      if (const auto converted = from_page_.convert(std::string(bytes.substr(0, length)))) {
        text += from_utf16_bytes(*converted);
        return length;
      }
    }
    text += u'\uFFFD';
    return 1;
  }

  Converter to_page_;
  Converter from_page_;
  std::size_t longest_character_;
  std::string substitute_;
};

}  // namespace

std::vector<std::uint32_t> code_page_numbers() {
  std::vector<std::uint32_t> numbers;
  for (const PageRow& row : rows) numbers.push_back(row.number);
  return numbers;
}

std::uint32_t chosen_code_page() {
  const std::string written = environment(variable);
  if (written.empty()) return western;
  std::uint32_t number = 0;
  const char* const end = written.data() + written.size();
  const auto [stop, error] = std::from_chars(written.data(), end, number);
  const bool is_known = error == std::errc() && stop == end && std::ranges::count(rows, number, &PageRow::number) > 0;
  if (!is_known) throw unknown_page(std::string(variable) + ": \"" + written + "\"");
  return number;
}

std::unique_ptr<CodePage> make_code_page(std::uint32_t number) {
  if (number == western) return std::make_unique<WesternCodePage>();
  const auto* const row = std::ranges::find(rows, number, &PageRow::number);
  if (row == std::end(rows)) throw unknown_page(std::to_string(number));
  return std::make_unique<LibraryCodePage>(*row);
}

}  // namespace talutil::posix
