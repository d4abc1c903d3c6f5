#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "platform/page_model.hpp"

namespace talutil {

/// The operators that draw one page of a PDF file, for boxes and for texts in standard fonts, of which reports have the
/// most. Colours, fonts and line widths are only set where they change. Vertical positions are from the bottom of the
/// page.
class PageOperators {
 public:
  /// Draws a text from the start of its baseline.
  /// @param font the page's name for the font
  /// @param bytes the text in code page 1252
  void text(std::string_view font, float points, std::uint32_t colour, std::int32_t left, std::int32_t bottom,
            std::string_view bytes);

  void filled(const TwipsRectangle& place, std::int32_t bottom, std::uint32_t colour);
  void framed(const TwipsRectangle& place, std::int32_t bottom, std::int32_t line_width, std::uint32_t colour);

  /// Returns the operators that were added since the last call. What they have set no longer counts as set, so that
  /// other operators may come between.
  [[nodiscard]] std::string take();

 private:
  void number(std::int64_t value, int decimals);
  void length(std::int32_t twips) { number(std::int64_t{twips} * 5, 2); }
  void colour(std::optional<std::uint32_t>& current, std::uint32_t wanted, std::string_view setter);
  void rectangle(const TwipsRectangle& place, std::int32_t bottom);

  std::string operators_;
  std::optional<std::uint32_t> fill_;
  std::optional<std::uint32_t> stroke_;
  std::optional<std::int32_t> line_width_;
  std::string font_;
  float points_ = 0;
  bool fills_letters_ = false;
};

}  // namespace talutil
