#pragma once

#include "platform/win32/handle.hpp"

namespace talutil::win32 {

/// The system's font for texts on windows, with the measures that dialog units stand for.
class SystemFont {
 public:
  SystemFont();

  [[nodiscard]] HGDIOBJ get() const noexcept { return font_ ? font_.get() : GetStockObject(DEFAULT_GUI_FONT); }

  /// Pixels of dialog units, across and down.
  [[nodiscard]] int across(int units) const noexcept { return MulDiv(units, width_, 4); }
  [[nodiscard]] int down(int units) const noexcept { return MulDiv(units, height_, 8); }

  /// How high a text is that is broken into a width, in pixels.
  [[nodiscard]] int height_of(const Text& text, int width) const;

 private:
  Owned<kind::Font> font_;
  int width_ = 0;   ///< Of the average letter, in pixels.
  int height_ = 0;  ///< Of a line.
};

}  // namespace talutil::win32
