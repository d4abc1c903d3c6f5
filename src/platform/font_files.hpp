#pragma once

#include <cstdint>
#include <vector>

namespace talutil {

class FontFiles {
 public:
  virtual ~FontFiles() = default;

  /// The bytes of a TrueType font of fixed or of proportional width that has the letters of most scripts and may be
  /// embedded in documents; empty where there is none.
  [[nodiscard]] virtual std::vector<std::uint8_t> wide_font(bool is_fixed_width) = 0;
};

}  // namespace talutil
