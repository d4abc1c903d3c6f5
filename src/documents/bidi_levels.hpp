#pragma once

#include <cstddef>
#include <vector>

#include "documents/character_tables.hpp"

/// The Unicode Bidirectional Algorithm (UAX #9) for one line that is a paragraph of its own.
namespace talutil {

/// Odd for what runs from right to left.
using BidiLevel = std::uint8_t;

/// Of characters that only steer the algorithm and have no place in the line.
constexpr BidiLevel no_level = 0xFF;

struct BidiCharacter {
  BidiClass kind = BidiClass::ON;
  char32_t code = 0;  ///< For paired brackets.
};

[[nodiscard]] BidiClass bidi_class(char32_t code);

/// The level that the first strong character outside isolates gives a paragraph: 0 or 1; 0 if there is none.
[[nodiscard]] BidiLevel base_level(std::span<const BidiCharacter> line);

/// The level of each character, with blanks at the end at the base level.
[[nodiscard]] std::vector<BidiLevel> bidi_levels(std::span<const BidiCharacter> line, BidiLevel base);

/// The indexes of the characters from left to right, without those that have no level.
[[nodiscard]] std::vector<std::size_t> visual_order(std::span<const BidiLevel> levels);

}  // namespace talutil
