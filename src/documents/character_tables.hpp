#pragma once

#include <cstdint>
#include <span>

/// What the Unicode Character Database says of characters, as far as the order of a line depends on it. The tables are
/// written at build time by tools/character_tables.py; each is sorted by its first column.
namespace talutil {

/// The bidirectional classes, named as in the Unicode Bidirectional Algorithm (UAX #9).
enum class BidiClass : std::uint8_t {
  L,
  R,
  AL,
  EN,
  ES,
  ET,
  AN,
  CS,
  NSM,
  BN,
  B,
  S,
  WS,
  ON,
  LRE,
  LRO,
  RLE,
  RLO,
  PDF,
  LRI,
  RLI,
  FSI,
  PDI,
};

/// The characters from here to the next start have this class.
struct ClassStart {
  char32_t first;
  BidiClass kind;
};

struct Bracket {
  char32_t bracket;
  char32_t pair;
  bool is_opening;
};

/// A character that is drawn as another where the text runs from right to left.
struct MirroredPair {
  char16_t unit;
  char16_t mirrored;
};

/// A letter's presentation forms; 0 for one that it does not have.
struct ArabicLetter {
  char16_t letter;
  char16_t isolated;
  char16_t final;
  char16_t initial;
  char16_t medial;
};

/// The ligatures of the letter lam with an alef.
struct LamAlef {
  char16_t alef;
  char16_t isolated;
  char16_t final;
};

extern const std::span<const ClassStart> class_starts;
extern const std::span<const Bracket> brackets;
extern const std::span<const MirroredPair> mirrored_pairs;
extern const std::span<const ArabicLetter> arabic_letters;
extern const std::span<const LamAlef> lam_alefs;

}  // namespace talutil
