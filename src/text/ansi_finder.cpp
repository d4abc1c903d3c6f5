#include "text/ansi_finder.hpp"

#include <algorithm>

namespace talutil {

namespace {

constexpr std::size_t block_length = 32;
constexpr std::size_t code_unit_count = 0x10000;

// Enough to justify 64 KB of cached answers.
constexpr std::uint32_t questions_before_keeping = 1024;

/// ASCII, and as much of Latin-1 as has the same codes on the page: for these the code is the unit itself.
constexpr bool is_near(char16_t unit, char16_t latin_count) noexcept {
  return (unit < 0x80) | (static_cast<char16_t>(unit - 0xA0) < latin_count);
}

/// 1 for a character that may match: the wanted one, and any that is not "near". Branch-free, because branches would be
/// unpredictable, and so that the compiler can vectorise it.
constexpr char16_t is_candidate(char16_t unit, char16_t wanted, char16_t latin_count) noexcept {
  return static_cast<char16_t>(int{unit == wanted} | int{!is_near(unit, latin_count)});
}

bool is_plain_block(const char16_t* block, char16_t wanted, char16_t latin_count) noexcept {
  char16_t candidates = 0;
  for (std::size_t i = 0; i < block_length; ++i) candidates |= is_candidate(block[i], wanted, latin_count);
  return candidates == 0;
}

}  // namespace

std::size_t AnsiFinder::find(TextView text, std::size_t from) {
  while (answers_.empty()) {
    if (from == text.size()) return from;
    const std::size_t length = std::min(block_length, text.size() - from);
    if (length < block_length || !is_plain_block(text.data() + from, near_wanted_, latin_count_)) {
      const std::size_t found = find_in_block(text.substr(from, length));
      if (found < length) return from + found;
    }
    from += length;
  }
  return skip(no, text, from);
}

std::size_t AnsiFinder::find_other(TextView text, std::size_t from) {
  while (answers_.empty()) {
    if (from == text.size() || !matches(text[from])) return from;
    ++from;
  }
  return skip(yes, text, from);
}

std::size_t AnsiFinder::find_in_block(TextView block) {
  std::size_t at = 0;
  for (; at < block.size(); ++at) {
    if (is_candidate(block[at], near_wanted_, latin_count_) != 0 && matches(block[at])) break;
  }
  return at;
}

std::size_t AnsiFinder::skip(Answer answer, TextView text, std::size_t from) {
  for (const Answer* const answers = answers_.data(); from < text.size(); ++from) {
    const Answer known = answers[text[from]];
    if (known == answer) continue;
    if (known != unknown || matches(text[from]) != (answer == yes)) break;
  }
  return from;
}

bool AnsiFinder::matches(char16_t unit) {
  if (answers_.empty()) return is_near(unit, latin_count_) ? unit == code_ : ask(unit);
  Answer& answer = answers_[unit];
  if (answer == unknown) answer = ask(unit) ? yes : no;
  return answer == yes;
}

bool AnsiFinder::ask(char16_t unit) {
  if (answers_.empty() && ++questions_ == questions_before_keeping) answers_.assign(code_unit_count, unknown);
  return page_.code(unit) == code_;
}

}  // namespace talutil
