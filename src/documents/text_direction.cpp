#include "documents/text_direction.hpp"

#include <algorithm>

#include "documents/bidi_levels.hpp"

namespace talutil {

namespace {

/// Whether a line with this character may have another order than that in which it is read, or invisible characters.
constexpr bool is_special(char16_t unit) noexcept {
  return (unit >= 0x0590 && unit <= 0x08FF) || is_invisible(unit) || (unit >= 0xFB1D && unit <= 0xFDFF) ||
         (unit >= 0xFE70 && unit <= 0xFEFE) || (unit >= 0xD802 && unit <= 0xD83B);
}

bool is_high_surrogate(char16_t unit) noexcept { return (unit & 0xFC00) == 0xD800; }
bool is_low_surrogate(char16_t unit) noexcept { return (unit & 0xFC00) == 0xDC00; }

/// The number of units of the character at a place.
std::size_t units_at(TextView text, std::size_t at) noexcept {
  const bool is_pair = is_high_surrogate(text[at]) && at + 1 < text.size() && is_low_surrogate(text[at + 1]);
  return is_pair ? 2 : 1;
}

char32_t code_at(TextView text, std::size_t at) noexcept {
  if (units_at(text, at) == 1) return text[at];
  return 0x10000 + ((static_cast<char32_t>(text[at]) & 0x3FF) << 10) + (text[at + 1] & 0x3FF);
}

/// The second unit of a pair counts as a mark, which follows the first.
std::vector<BidiCharacter> characters_of(TextView text) {
  std::vector<BidiCharacter> characters;
  characters.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char32_t code = code_at(text, i);
    BidiClass kind = bidi_class(code);
    // A soft hyphen and the like are drawn.
    if (kind == BidiClass::BN && !is_invisible(text[i])) kind = BidiClass::ON;
    characters.push_back({kind, code});
    if (units_at(text, i) == 2) {
      characters.push_back({BidiClass::NSM, 0});
      ++i;
    }
  }
  return characters;
}

char16_t mirrored(char16_t unit) {
  const auto found = std::ranges::lower_bound(mirrored_pairs, unit, {}, &MirroredPair::unit);
  return found != mirrored_pairs.end() && found->unit == unit ? found->mirrored : unit;
}

}  // namespace

bool is_mark(char16_t unit) { return unit >= 0x0300 && bidi_class(unit) == BidiClass::NSM; }

bool is_seen_as_read(TextView line) { return std::ranges::none_of(line, is_special); }

bool is_right_to_left(TextView paragraph) {
  return !is_seen_as_read(paragraph) && base_level(characters_of(paragraph)) == 1;
}

std::vector<DirectedText> in_visual_order(TextView line, bool is_paragraph_right_to_left) {
  const std::vector<BidiLevel> levels = bidi_levels(characters_of(line), is_paragraph_right_to_left ? 1 : 0);
  std::vector<DirectedText> parts;
  std::vector<std::size_t> order = visual_order(levels);
  for (std::size_t i = 0; i < order.size();) {
    const BidiLevel level = levels[order[i]];
    const bool is_reversed = level % 2 == 1;
    std::size_t end = i + 1;
    while (end < order.size() && levels[order[end]] == level) ++end;
    // Back into the order of reading.
    if (is_reversed)
      std::reverse(order.begin() + static_cast<std::ptrdiff_t>(i), order.begin() + static_cast<std::ptrdiff_t>(end));
    DirectedText& part = parts.emplace_back(DirectedText{{}, is_reversed});
    for (; i < end; ++i) {
      if (!is_invisible(line[order[i]])) part.text += line[order[i]];
    }
  }
  return parts;
}

Text drawn_from_left(TextView right_to_left) {
  Text drawn;
  drawn.reserve(right_to_left.size());
  for (std::size_t end = right_to_left.size(); end > 0;) {
    const bool is_pair =
        end > 1 && is_low_surrogate(right_to_left[end - 1]) && is_high_surrogate(right_to_left[end - 2]);
    const std::size_t first = end - (is_pair ? 2 : 1);
    drawn += mirrored(right_to_left[first]);
    if (is_pair) drawn += right_to_left[first + 1];
    end = first;
  }
  return drawn;
}

}  // namespace talutil
