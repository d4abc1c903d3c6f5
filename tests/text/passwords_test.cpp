#include <cmath>
#include <map>

#include "tests/fakes/late_members.hpp"

namespace talutil::testing {
namespace {

using Passwords = LateMembers;

TEST_F(Passwords, AMillionDrawsOfEachMixAreAsLikelyAsTold) {
  const std::tuple<std::int16_t, std::int16_t, TextView> rows[] = {
      {0, 9, u"0123456789"},
      {1, 9, u"ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz`~!@#$%^&*()_-+=[]{}:;'<,>.?/|\\"},
      {2, 0, u"ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz`~!@#$%^&*()_-+=[]{}:;'<,>.?/|\\0123456789"},
      {2, 1, u"0123456789ABCDEF"},
  };
  for (const auto& [mix, hex, characters] : rows) {
    SCOPED_TRACE(to_utf8(characters));
    std::map<char16_t, double> seen;
    for (int call = 0; call < 31; ++call) {
      const Text password = utils.GenerateFilePassword(32767, mix, hex);
      ASSERT_EQ(password.size(), 32767U);
      EXPECT_EQ(std::ranges::adjacent_find(password), password.end()) << "the one before is left out";
      for (const char16_t unit : password) ++seen[unit];
    }
    EXPECT_EQ(seen.size(), characters.size()) << "characters of another mix";
    // Both ends of a mix have half the weight of the rest; what follows itself is drawn again.
    double all = 0;
    std::vector<double> shares;
    for (const char16_t unit : characters) {
      const bool is_an_end = unit == characters.front() || unit == characters.back();
      const double odds = (is_an_end ? 0.5 : 1) / (static_cast<double>(characters.size()) - 1);
      all += shares.emplace_back(odds * (1 - odds));
    }
    for (std::size_t i = 0; i < shares.size(); ++i) {
      const double expected = 31 * 32767 * shares[i] / all;
      EXPECT_LT(std::abs(seen[characters[i]] - expected), 5 * std::sqrt(expected)) << i;
    }
  }
}

TEST_F(Passwords, HalvesRoundToEvenAndRepeatedDrawsAreDropped) {
  constexpr std::uint32_t one = 1U << 24;
  std::vector<std::uint32_t> numbers;  // in 2^-24, then zeros
  int seeded = 0;
  platform.random_bytes = [&](std::span<std::uint8_t> bytes) {
    ++seeded;
    std::ranges::fill(bytes, std::uint8_t{0});
    for (std::size_t i = 0; i < 3 * numbers.size(); ++i) {
      bytes[i] = static_cast<std::uint8_t>(numbers[i / 3] >> (8 * (i % 3)));
    }
  };
  // The largest number below 1 is an end; x * 92 of 0.5, 1.5 and 2.5 go to 0, 2 and 2.
  numbers = {one - 1, one - 1, 0, one / 184 + 1, 3 * (one / 184), 5 * (one / 184), one / 2};
  EXPECT_EQ(utils.GenerateFilePassword(5, 2, 0), u"9ABCu");
  // The first draw of the table's mixes may not be its number 36.
  numbers = {one / 82 * 36, one / 82 * 37};
  EXPECT_EQ(utils.GenerateFilePassword(1, 1, 0), u"l");
  numbers = {one / 2, one / 4};  // x * 9 = 4.5 and 2.25
  EXPECT_EQ(utils.GenerateFilePassword(2, 0, 0), u"42");
  EXPECT_EQ(seeded, 3) << "once a call";
  EXPECT_EQ(platform.messages_handled, 7 + 2 + 2) << "before each draw";
}

TEST_F(Passwords, NothingToDraw) {
  check({{u"GenerateFilePassword",
          {{u"0|1|0", ""}, {u"-32768|2|0", ""}, {u"5|7|0", ""}, {u"5|-1|1", ""}, {u"1|2|5", "A"}, {u"0|2|5", ""}}}});
  EXPECT_EQ(platform.waits, 0);
  // It sleeps between messages until the thread is asked to quit.
  platform.quits_after_waits = 3;
  check({{u"GenerateFilePassword", {{u"2|2|5", "error 18"}}}});
  EXPECT_EQ(platform.waits, 3);
}

}  // namespace
}  // namespace talutil::testing
