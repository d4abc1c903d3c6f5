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
};

}  // namespace talutil
