#pragma once

#include <cstdint>
#include <vector>

namespace talutil {

class FontFiles {
 public:
  virtual ~FontFiles() = default;

  /// The bytes of a TrueType font, fixed-width or proportional, that covers most scripts and may be embedded in
  /// documents; empty if there is none.
  [[nodiscard]] virtual std::vector<std::uint8_t> wide_font(bool is_fixed_width) = 0;

  /// The bytes of a TrueType font that was named for characters that these lack; empty if there is none.
  [[nodiscard]] virtual std::vector<std::uint8_t> named_font() { return {}; }
};

}  // namespace talutil
