#include "automation/checked.hpp"
#include "automation/run_time_error.hpp"
#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "text/random_singles.hpp"

namespace talutil {

namespace {

/// The characters to draw: letters, symbols, digits, and the remaining hexadecimal digits.
constexpr TextView character_table =
    u"ABCDEFGHIJKLMNOPQRSTUVWXYZ"
    u"abcdefghijklmnopqrstuvwxyz"
    u"`~!@#$%^&*()_-+=[]{}:;'<,>.?/|\\"
    u"0123456789"
    u"ABCDEF";
constexpr TextView decimal_digits = u"0123456789";
static_assert(character_table.size() == 99 && character_table[52] == u'`' && character_table[82] == u'\\' &&
              character_table[92] == u'9' && character_table[98] == u'F');

/// A draw is a random number below 1, scaled and rounded with halves to even, so both ends are half as frequent as the
/// numbers in between.
struct Mix {
  TextView characters;
  float scale = 0;
  float offset = 0;
  std::int32_t previous = 36;  ///< The number that the first draw must not be.
  bool draws = true;           ///< If false, the number stays 0.
};

/// Mix 2 with an iHex of neither 0 nor 1 draws nothing.
Mix mix_of(std::int16_t mix, std::int16_t hex) {
  if (mix == 0) return {decimal_digits, 9, 0, 11};
  if (mix == 1) return {character_table, 82};
  if (mix == 2 && hex == 0) return {character_table, 92};
  if (mix == 2 && hex == 1) return {character_table, 15, 83};
  if (mix == 2) return {.characters = character_table, .draws = false};
  return {};
}

/// Draws until the number differs from the previous one.
std::int32_t draw(const Mix& mix, std::int32_t previous, RandomSingles& random, MessagePump& messages) {
  messages.handle_waiting();
  if (!mix.draws) {
    // The number would be repeated forever, so the member does not return. It sleeps between the host's messages and
    // gives up when the host is asked to quit.
    while (previous == 0) {
      if (!messages.wait_and_handle()) raise(ErrorNumber::user_interrupt);
    }
    return 0;
  }
  const auto drawn = [&] { return round_to<std::int32_t>(random.next() * mix.scale + mix.offset); };
  std::int32_t number = drawn();
  while (number == previous) {
    messages.handle_waiting();
    number = drawn();
  }
  return number;
}

}  // namespace

Text ORVUtils::GenerateFilePassword(const std::int16_t& iMaxLength, const std::int16_t& iMix,
                                    const std::int16_t& iHex) {
  const Platform& platform = library().platform();
  const Mix mix = mix_of(iMix, iHex);
  RandomSingles random(platform.random_source);
  // A host may change its variable while messages are handled; use the length that was passed.
  const std::int16_t length = mix.characters.empty() ? std::int16_t{0} : iMaxLength;

  Text result;
  std::int32_t previous = mix.previous;
  for (std::int16_t position = 0; position < length; ++position) {
    previous = draw(mix, previous, random, platform.message_pump);
    result += mix.characters[static_cast<std::size_t>(previous)];
  }
  return result;
}

}  // namespace talutil
