#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "automation/text.hpp"

namespace talutil {

/// The ANSI code page by which members compare characters. ASCII is itself on every page.
///
/// The codes are kept once they have been asked for, so that a long text costs no conversion for each character.
class CodePage {
 public:
  CodePage() = default;
  CodePage(const CodePage&) = delete;
  CodePage& operator=(const CodePage&) = delete;
  virtual ~CodePage() = default;

  /// The code that the platform's Asc primitive gives for one code unit: the bytes of its conversion read as one
  /// number, the first byte highest. 0 to 255 on single-byte pages; double-byte characters lie above 255, and UTF-8 has
  /// up to three bytes. A unit that the page does not hold has the code of its substitute, that of "?" for most.
  [[nodiscard]] std::uint32_t code(char16_t unit) {
    if (codes_.empty()) begin();
    std::uint32_t& code = codes_[unit];
    if (code == unknown) code = ask(unit);
    return code;
  }

  /// How many units from U+00A0 on are their own code, one after the other: 96 where the page has the upper half of
  /// Latin-1, so that such texts need not be looked at character by character.
  [[nodiscard]] char16_t latin_count() {
    if (codes_.empty()) begin();
    return latin_count_;
  }

  /// The bytes of a text, with the page's substitutes, and the text of bytes, where bytes that are no character become
  /// the platform's sign for them.
  [[nodiscard]] virtual std::string bytes_of(TextView text) = 0;
  [[nodiscard]] virtual Text text_of(std::string_view bytes) = 0;

 private:
  static constexpr std::uint32_t unknown = 0xFFFFFFFF;

  void begin();
  [[nodiscard]] std::uint32_t ask(char16_t unit);

  std::vector<std::uint32_t> codes_;  ///< One for each code unit; empty until the first question.
  char16_t latin_count_ = 0;
};

/// Code page 1252 by the table of our own, which every platform has.
class WesternCodePage final : public CodePage {
 public:
  [[nodiscard]] std::string bytes_of(TextView text) override { return to_ansi(text); }
  [[nodiscard]] Text text_of(std::string_view bytes) override { return from_ansi(bytes); }
};

}  // namespace talutil
