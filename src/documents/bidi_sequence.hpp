#pragma once

#include <vector>

#include "documents/bidi_levels.hpp"

namespace talutil {

/// Characters of one level that affect each other's direction (an isolating run sequence of UAX #9).
class BidiSequence {
 public:
  /// `members` are indexes into the line; `before` and `after` the directions of the boundaries, L or R.
  BidiSequence(std::span<const BidiCharacter> line, const std::vector<std::size_t>& members, BidiLevel level,
               BidiClass before, BidiClass after)
      : line_(line), members_(members), level_(level), before_(before), after_(after) {}

  /// Resolves the members' classes, given as overrides have left them, and raises their levels accordingly.
  void resolve(const std::vector<BidiClass>& kinds, std::vector<BidiLevel>& levels);

 private:
  struct Pair {
    std::size_t opening;
    std::size_t closing;
  };

  void resolve_marks_and_numbers();
  void resolve_separators();
  [[nodiscard]] std::vector<Pair> bracket_pairs() const;
  void resolve_brackets();
  void set_direction(std::size_t bracket, BidiClass direction);
  void resolve_neutrals();
  [[nodiscard]] BidiClass embedding() const noexcept { return level_ % 2 == 0 ? BidiClass::L : BidiClass::R; }

  std::span<const BidiCharacter> line_;
  const std::vector<std::size_t>& members_;
  BidiLevel level_;
  BidiClass before_;
  BidiClass after_;
  std::vector<BidiClass> kinds_;  ///< By member.
};

}  // namespace talutil
