#include "documents/bidi_sequence.hpp"

#include <algorithm>
#include <optional>

// The rules are named as in UAX #9, which explains them.
namespace talutil {

namespace {

using enum BidiClass;

bool is_isolate(BidiClass kind) noexcept { return kind == LRI || kind == RLI || kind == FSI || kind == PDI; }

bool is_neutral(BidiClass kind) noexcept {
  return kind == B || kind == S || kind == WS || kind == ON || is_isolate(kind);
}

/// For brackets and neutrals, numbers count as running from right to left.
std::optional<BidiClass> direction_of(BidiClass kind) noexcept {
  if (kind == L) return L;
  if (kind == R || kind == EN || kind == AN) return R;
  return std::nullopt;
}

const Bracket* bracket_of(char32_t code) {
  const auto found = std::ranges::lower_bound(brackets, code, {}, &Bracket::bracket);
  return found != brackets.end() && found->bracket == code ? &*found : nullptr;
}

/// The angle brackets of technical texts are canonically the same as those of East Asian ones.
char32_t same_bracket(char32_t bracket) noexcept {
  if (bracket == 0x2329) return 0x3008;
  if (bracket == 0x232A) return 0x3009;
  return bracket;
}

}  // namespace

void BidiSequence::resolve(const std::vector<BidiClass>& kinds, std::vector<BidiLevel>& levels) {
  kinds_.clear();
  for (const std::size_t at : members_) kinds_.push_back(kinds[at]);
  resolve_marks_and_numbers();
  resolve_separators();
  resolve_brackets();
  resolve_neutrals();
  // I1 and I2.
  for (std::size_t i = 0; i < members_.size(); ++i) {
    BidiLevel& level = levels[members_[i]];
    if (level % 2 == 0) {
      if (kinds_[i] == R) level += 1;
      if (kinds_[i] == AN || kinds_[i] == EN) level += 2;
    } else if (kinds_[i] != R) {
      level += 1;
    }
  }
}

/// W1 to W3: marks are like the letter before them, and digits after an Arabic letter are Arabic ones.
void BidiSequence::resolve_marks_and_numbers() {
  BidiClass previous = before_;
  BidiClass strong = before_;
  for (BidiClass& kind : kinds_) {
    if (kind == NSM) kind = is_isolate(previous) ? ON : previous;
    previous = kind;
    if (kind == L || kind == R || kind == AL) strong = kind;
    if (kind == EN && strong == AL) kind = AN;
  }
  std::ranges::replace(kinds_, AL, R);
}

/// W4 to W7: signs within and beside numbers belong to them; what is left of them is neutral.
void BidiSequence::resolve_separators() {
  for (std::size_t i = 1; i + 1 < kinds_.size(); ++i) {
    const BidiClass number = kinds_[i - 1];
    if (kinds_[i + 1] != number) continue;
    if (kinds_[i] == CS && (number == EN || number == AN)) kinds_[i] = number;
    if (kinds_[i] == ES && number == EN) kinds_[i] = number;
  }
  for (std::size_t i = 0; i < kinds_.size();) {
    std::size_t end = i;
    while (end < kinds_.size() && kinds_[end] == ET) ++end;
    const bool is_beside_number = (i > 0 && kinds_[i - 1] == EN) || (end < kinds_.size() && kinds_[end] == EN);
    if (is_beside_number)
      std::fill(kinds_.begin() + static_cast<std::ptrdiff_t>(i), kinds_.begin() + static_cast<std::ptrdiff_t>(end), EN);
    i = end + 1;
  }
  BidiClass strong = before_;
  for (BidiClass& kind : kinds_) {
    if (kind == ES || kind == ET || kind == CS) kind = ON;
    if (kind == L || kind == R) strong = kind;
    if (kind == EN && strong == L) kind = L;
  }
}

/// BD16, in the order of the opening brackets.
std::vector<BidiSequence::Pair> BidiSequence::bracket_pairs() const {
  constexpr std::size_t most_open = 63;
  struct Open {
    char32_t pair;
    std::size_t at;
  };
  std::vector<Open> open;
  std::vector<Pair> pairs;
  for (std::size_t i = 0; i < members_.size(); ++i) {
    const char32_t code = line_[members_[i]].code;
    const Bracket* const bracket = kinds_[i] == ON ? bracket_of(code) : nullptr;
    if (bracket == nullptr) continue;
    if (bracket->is_opening) {
      if (open.size() == most_open) return {};
      open.push_back({same_bracket(bracket->pair), i});
      continue;
    }
    const auto found =
        std::find_if(open.rbegin(), open.rend(), [&](const Open& one) { return one.pair == same_bracket(code); });
    if (found == open.rend()) continue;
    pairs.push_back({found->at, i});
    open.erase(std::prev(found.base()), open.end());
  }
  std::ranges::sort(pairs, {}, &Pair::opening);
  return pairs;
}

/// N0: a pair of brackets runs like its contents, or like what is before it if both are against the embedding.
void BidiSequence::resolve_brackets() {
  for (const auto& [opening, closing] : bracket_pairs()) {
    bool has_embedding = false;
    bool has_opposite = false;
    for (std::size_t i = opening + 1; i < closing && !has_embedding; ++i) {
      const auto direction = direction_of(kinds_[i]);
      has_embedding = direction == embedding();
      has_opposite = has_opposite || (direction && !has_embedding);
    }
    if (!has_embedding && !has_opposite) continue;
    BidiClass direction = embedding();
    if (!has_embedding) {
      direction = before_;
      for (std::size_t i = opening; i-- > 0;) {
        if (const auto found = direction_of(kinds_[i])) {
          direction = *found;
          break;
        }
      }
    }
    set_direction(opening, direction);
    set_direction(closing, direction);
  }
}

/// Marks on a bracket follow it.
void BidiSequence::set_direction(std::size_t bracket, BidiClass direction) {
  kinds_[bracket] = direction;
  for (std::size_t i = bracket + 1; i < kinds_.size() && line_[members_[i]].kind == NSM; ++i) kinds_[i] = direction;
}

/// N1 and N2: neutrals between two of the same direction follow these, others the embedding.
void BidiSequence::resolve_neutrals() {
  BidiClass left = before_;
  for (std::size_t i = 0; i < kinds_.size();) {
    if (!is_neutral(kinds_[i])) {
      left = *direction_of(kinds_[i]);
      ++i;
      continue;
    }
    std::size_t end = i;
    while (end < kinds_.size() && is_neutral(kinds_[end])) ++end;
    const BidiClass right = end < kinds_.size() ? *direction_of(kinds_[end]) : after_;
    for (; i < end; ++i) kinds_[i] = left == right ? left : embedding();
  }
}

}  // namespace talutil
