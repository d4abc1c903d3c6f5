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

  Text text(std::size_t longest) {
    Text text;
    for (std::size_t length = byte() % (longest + 1); length > 0 && at_ != end_; --length) {
      const std::uint8_t choice = byte();
      text += choice < 128 ? common_[choice % common_.size()] : static_cast<char16_t>(byte() << 8 | byte());
    }
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
