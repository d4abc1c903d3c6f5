#pragma once

#include <array>
#include <cstdint>

#include "platform/cryptography.hpp"

namespace talutil {

/// Uniform single-precision numbers x, 0 <= x < 1, in steps of 2^-24, the finest that a single resolves just below 1.
class RandomSingles {
 public:
  /// Takes fresh bytes from the source.
  explicit RandomSingles(RandomSource& source) : source_(source) { refill(); }

  [[nodiscard]] float next() {
    if (used_ + 3 > bytes_.size()) refill();
    const std::uint32_t bits = bytes_[used_] | bytes_[used_ + 1] << 8U | bytes_[used_ + 2] << 16U;
    used_ += 3;
    return static_cast<float>(bits) / static_cast<float>(1U << 24U);
  }

 private:
  void refill() {
    source_.fill(bytes_);
    used_ = 0;
  }

  RandomSource& source_;
  std::array<std::uint8_t, 96> bytes_{};
  std::size_t used_ = 0;
};

}  // namespace talutil
