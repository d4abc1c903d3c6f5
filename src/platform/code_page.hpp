#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "automation/text.hpp"

namespace talutil {

/// The ANSI code page by which members compare characters. ASCII codes are the same on every page.
///
/// Codes are cached, so that a long text does not cost one conversion per character.
class CodePage {
 public:
  CodePage() = default;
  CodePage(const CodePage&) = delete;
  CodePage& operator=(const CodePage&) = delete;
  virtual ~CodePage() = default;

  /// The code that the platform's Asc primitive returns for one code unit: the converted bytes read as one number, the
  /// first byte highest. 0 to 255 on single-byte pages; double-byte characters are above 255, and UTF-8 has up to three
  /// bytes. A unit that the page lacks has the code of its substitute, in most cases that of "?".
  [[nodiscard]] std::uint32_t code(char16_t unit) {
    if (codes_.empty()) begin();
    std::uint32_t& code = codes_[unit];
    if (code == unknown) code = ask(unit);
    return code;
  }

  /// How many consecutive units from U+00A0 on are their own code. 96 if the page has the upper half of Latin-1: such
  /// texts need no look-up character by character.
  [[nodiscard]] char16_t latin_count() {
    if (codes_.empty()) begin();
    return latin_count_;
  }

  /// Conversion to bytes, with the page's substitutes, and back, with the platform's replacement for bytes that are not
  /// characters.
  [[nodiscard]] virtual std::string bytes_of(TextView text) = 0;
  [[nodiscard]] virtual Text text_of(std::string_view bytes) = 0;

  /// Appends the text of some bytes.
  virtual void append_text(Text& text, std::string_view bytes) { text += text_of(bytes); }

  /// Whether every character of a text is on the page, so that its bytes say the same.
  [[nodiscard]] bool holds(TextView text) { return is_ascii(text) || text_of(bytes_of(text)) == text; }

 private:
  static constexpr std::uint32_t unknown = 0xFFFFFFFF;

  void begin();
  [[nodiscard]] std::uint32_t ask(char16_t unit);

  std::vector<std::uint32_t> codes_;  ///< One per code unit; empty until the first use.
  char16_t latin_count_ = 0;
};

/// Code page 1252 from our own table, which is available on every platform.
class WesternCodePage final : public CodePage {
 public:
  [[nodiscard]] std::string bytes_of(TextView text) override { return to_ansi(text); }
  [[nodiscard]] Text text_of(std::string_view bytes) override { return from_ansi(bytes); }
  void append_text(Text& text, std::string_view bytes) override { append_ansi(text, bytes); }
};

}  // namespace talutil
