#pragma once

#include <cstdint>
#include <vector>

#include "automation/text.hpp"

namespace talutil {

/// Finds the characters of one ANSI code in long texts.
///
/// Nearly all text is ASCII and Latin-1, where a character can match only by being the wanted one, so such
/// text is passed over in blocks. For the others the finder asks for their code; once it has asked often, it
/// keeps the answers.
class AnsiFinder {
 public:
  explicit AnsiFinder(std::uint8_t code) noexcept : code_(code) {}

  /// The index of the first character of the code at or after `from`; the text's size when there is none.
  [[nodiscard]] std::size_t find(TextView text, std::size_t from);

  /// The index of the first character of another code at or after `from`; the text's size when there is none.
  [[nodiscard]] std::size_t find_other(TextView text, std::size_t from);

 private:
  enum Answer : std::uint8_t { no, yes, unknown };

  [[nodiscard]] std::size_t find_in_block(TextView block);
  [[nodiscard]] std::size_t skip(Answer answer, TextView text, std::size_t from);
  [[nodiscard]] bool matches(char16_t unit);
  [[nodiscard]] bool ask(char16_t unit);

  std::uint8_t code_;
  std::uint32_t questions_ = 0;
  std::vector<Answer> answers_;  ///< One for each code unit; empty at first.
};

}  // namespace talutil
