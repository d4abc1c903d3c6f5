#pragma once

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string_view>

#include "automation/text.hpp"

namespace talutil::fuzz {

inline void require(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "broken: %s\n", what);
  std::abort();
}

/// Derives choices and texts from the fuzzer's bytes. Half of the characters come from a few common ones, so that words
/// repeat and special characters occur; the others are any code unit.
class Input {
 public:
  Input(const std::uint8_t* data, std::size_t size, TextView common) : at_(data), end_(data + size), common_(common) {}

  std::uint8_t byte() { return at_ == end_ ? std::uint8_t{0} : *at_++; }

  /// A number from first to last; first when no bytes are left.
  std::int32_t whole(std::int32_t first, std::int32_t last) {
    std::uint32_t drawn = 0;
    for (auto range = static_cast<std::uint32_t>(last) - static_cast<std::uint32_t>(first); range > 0; range >>= 8)
      drawn = drawn << 8 | byte();
    const std::uint64_t count = static_cast<std::uint64_t>(std::int64_t{last} - first) + 1;
    return static_cast<std::int32_t>(first + static_cast<std::int64_t>(drawn % count));
  }

  template <class Items>
  const auto& one_of(const Items& items) {
    return items[static_cast<std::size_t>(whole(0, static_cast<std::int32_t>(std::size(items)) - 1))];
  }

  /// Up to so many characters, at most 255.
  Text text(std::size_t longest) {
    Text text;
    for (std::size_t length = byte() % (longest + 1); length > 0 && at_ != end_; --length) {
      const std::uint8_t choice = byte();
      text += choice < 128 ? common_[choice % common_.size()] : static_cast<char16_t>(byte() << 8 | byte());
    }
    return text;
  }

  /// Up to so many characters of an alphabet and no others.
  Text word(TextView alphabet, std::int32_t longest) {
    Text text;
    for (std::int32_t length = whole(0, longest); length > 0; --length) text += one_of(alphabet);
    return text;
  }

  /// All bytes that have not been used yet.
  [[nodiscard]] std::string_view rest() const {
    return {reinterpret_cast<const char*>(at_), static_cast<std::size_t>(end_ - at_)};
  }

 private:
  const std::uint8_t* at_;
  const std::uint8_t* end_;
  TextView common_;
};

}  // namespace talutil::fuzz
