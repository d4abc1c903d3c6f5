#pragma once

#include <cstdint>
#include <vector>

#include "platform/code_page.hpp"

namespace talutil {

/// Finds the characters in long texts that have a wanted character's code.
///
/// Nearly all text is ASCII, or Latin-1 if the code page has it. There, only the wanted character itself can match, so
/// such text is skipped in blocks. For other characters the finder queries the code page; after many queries it starts
/// to cache the answers.
class AnsiFinder {
 public:
  AnsiFinder(CodePage& page, char16_t wanted)
      : page_(page),
        code_(page.code(wanted)),
        near_wanted_(static_cast<char16_t>(code_)),
        latin_count_(page.latin_count()) {}

  /// The index of the first character with the code at or after `from`; the text's size if there is none.
  [[nodiscard]] std::size_t find(TextView text, std::size_t from);

  /// The index of the first character with another code at or after `from`; the text's size if there is none.
  [[nodiscard]] std::size_t find_other(TextView text, std::size_t from);

 private:
  enum Answer : std::uint8_t { no, yes, unknown };

  [[nodiscard]] std::size_t find_in_block(TextView block);
  [[nodiscard]] std::size_t skip(Answer answer, TextView text, std::size_t from);
  [[nodiscard]] bool matches(char16_t unit);
  [[nodiscard]] bool ask(char16_t unit);

  CodePage& page_;
  std::uint32_t code_;
  char16_t near_wanted_;  ///< The one near character that can match. A longer code is truncated and matches none.
  char16_t latin_count_;
  std::uint32_t questions_ = 0;
  std::vector<Answer> answers_;  ///< One per code unit; empty at first.
};

}  // namespace talutil
