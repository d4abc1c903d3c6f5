#pragma once

#include "platform/win32/handle.hpp"

namespace talutil::win32 {

/// The system's font for windows, with the sizes on which dialog units are based.
class SystemFont {
 public:
  /// The font at a number of dots per inch.
  explicit SystemFont(int dots);

  [[nodiscard]] HGDIOBJ get() const noexcept { return font_ ? font_.get() : GetStockObject(DEFAULT_GUI_FONT); }

  /// Converts dialog units to pixels, horizontally and vertically.
  [[nodiscard]] int across(int units) const noexcept { return MulDiv(units, width_, 4); }
  [[nodiscard]] int down(int units) const noexcept { return MulDiv(units, height_, 8); }

  /// The height in pixels of a text that is wrapped at a width.
  [[nodiscard]] int height_of(const Text& text, int width) const;

 private:
  Owned<kind::Font> font_;
  int width_ = 0;   ///< Of the average letter, in pixels.
  int height_ = 0;  ///< Of a line, in pixels.
};

}  // namespace talutil::win32
