#include "documents/arabic_joining.hpp"

#include <algorithm>

#include "documents/bidi_levels.hpp"

namespace talutil {

namespace {

constexpr char16_t lam = 0x0644;
constexpr char16_t tatweel = 0x0640;
constexpr char16_t joiner = 0x200D;
constexpr char16_t non_joiner = 0x200C;

const ArabicLetter* letter_of(char16_t unit) {
  const auto found = std::ranges::lower_bound(arabic_letters, unit, {}, &ArabicLetter::letter);
  return found != arabic_letters.end() && found->letter == unit ? &*found : nullptr;
}

/// Marks stand on their letter and do not come between two that join.
bool is_transparent(char16_t unit) {
  return unit >= 0x0300 && unit != non_joiner && bidi_class(unit) == BidiClass::NSM;
}

bool joins_next(char16_t unit) {
  if (unit == tatweel || unit == joiner) return true;
  const ArabicLetter* const letter = letter_of(unit);
  return letter != nullptr && letter->initial != 0;
}

bool joins_previous(char16_t unit) {
  if (unit == tatweel || unit == joiner) return true;
  const ArabicLetter* const letter = letter_of(unit);
  return letter != nullptr && letter->final != 0;
}

/// The next letter at or after a place, behind the marks there; 0 at the end.
char16_t letter_from(TextView text, std::size_t at) {
  while (at < text.size() && is_transparent(text[at])) ++at;
  return at < text.size() ? text[at] : char16_t{0};
}

char16_t form_of(const ArabicLetter& letter, bool joins_before, bool joins_after) noexcept {
  const bool has_before = joins_before && letter.final != 0;
  const bool has_after = joins_after && letter.initial != 0;
  if (has_before && has_after) return letter.medial;
  if (has_before) return letter.final;
  return has_after ? letter.initial : letter.isolated;
}

}  // namespace

Text joined(TextView text) {
  if (std::ranges::none_of(text, is_joining)) return Text(text);
  Text result;
  bool joins_before = false;  // Whether the last letter joins this one.
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char16_t unit = text[i];
    if (is_transparent(unit)) {
      result += unit;
      continue;
    }
    const ArabicLetter* const letter = letter_of(unit);
    const char16_t next = letter_from(text, i + 1);
    const auto ligature = std::ranges::find(lam_alefs, next, &LamAlef::alef);
    // The marks of the lam stay before those of the alef, both behind the ligature.
    if (unit == lam && ligature != lam_alefs.end()) {
      result += joins_before ? ligature->final : ligature->isolated;
      for (++i; text[i] != next; ++i) result += text[i];
      joins_before = false;
      continue;
    }
    result += letter == nullptr ? unit : form_of(*letter, joins_before, joins_previous(next));
    joins_before = joins_next(unit);
  }
  return result;
}

char16_t letter_of_form(char16_t form) {
  constexpr char16_t first_form = 0xFB50;
  if (form < first_form) return form;
  for (const ArabicLetter& letter : arabic_letters) {
    for (const char16_t one : {letter.isolated, letter.final, letter.initial, letter.medial}) {
      if (one == form) return letter.letter;
    }
  }
  return form;
}

}  // namespace talutil
