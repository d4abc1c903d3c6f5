#pragma once

#include <cstdint>

namespace talutil {

/// Automation's Boolean: 16 bits, True is -1 and False 0. Hosts can store other bits, and some members check for
/// exactly True, so the bits are kept as given.
class Boolean {
 public:
  constexpr Boolean() noexcept = default;
  constexpr explicit Boolean(bool value) noexcept : bits_(value ? -1 : 0) {}

  [[nodiscard]] static constexpr Boolean from_bits(std::int16_t bits) noexcept {
    Boolean result;
    result.bits_ = bits;
    return result;
  }

  [[nodiscard]] constexpr std::int16_t bits() const noexcept { return bits_; }
  [[nodiscard]] constexpr bool is_exactly_true() const noexcept { return bits_ == -1; }
  constexpr explicit operator bool() const noexcept { return bits_ != 0; }

  friend constexpr bool operator==(Boolean, Boolean) noexcept = default;

 private:
  std::int16_t bits_ = 0;
};

}  // namespace talutil
