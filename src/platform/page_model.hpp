#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <utility>
#include <variant>
#include <vector>

#include "automation/text.hpp"

/// Documents as pages: laid out once, then drawn on the screen, on a printer and into PDF by renderers that have only
/// this model in common. A page is composed when it is drawn, so that a document takes little more memory than what it
/// shows. All lengths are in twips (1/1440 inch) from the top left corner of the paper; colours are
/// 0x00BBGGRR.
namespace talutil {

struct TwipsRectangle {
  std::int32_t left = 0;
  std::int32_t top = 0;
  std::int32_t width = 0;
  std::int32_t height = 0;
  friend bool operator==(const TwipsRectangle&, const TwipsRectangle&) = default;
};

enum class FontFamily : std::uint8_t { courier, helvetica, times };

struct FontStyle {
  FontFamily family = FontFamily::courier;
  bool is_bold = false;
  float points = 10;
  friend bool operator==(const FontStyle&, const FontStyle&) = default;
};

/// Converts a width in thousandths of the font's size to twips.
[[nodiscard]] constexpr double to_twips(double thousandths, const FontStyle& font) noexcept {
  constexpr double twips_per_point = 20;
  return thousandths * font.points * twips_per_point / 1000;
}

/// From the top of a line to the top of the next.
[[nodiscard]] constexpr std::int32_t line_height(const FontStyle& font) noexcept {
  return static_cast<std::int32_t>(to_twips(1200, font));
}

/// From the top of a line to its baseline.
[[nodiscard]] constexpr std::int32_t baseline(const FontStyle& font) noexcept {
  return static_cast<std::int32_t>(to_twips(900, font));
}

/// Characters on one line that are drawn together.
struct TextRun {
  std::int32_t left = 0;
  std::int32_t top = 0;  ///< Top of the line, not of its letters.
  std::int32_t width = 0;
  FontStyle font;
  bool is_wide = false;  ///< Has characters that code page 1252 lacks, drawn in another font.
  std::uint32_t colour = 0;
  Text text;  ///< In the order in which it is read; Arabic letters are in the forms in which they join.
  bool is_named_font = false;     ///< A wide run in the font that was named for it; see FontFiles.
  bool is_right_to_left = false;  ///< All of it.
};

/// A filled area, a frame, or both; with zero height or width, a rule.
struct Box {
  TwipsRectangle place;
  std::optional<std::uint32_t> fill;
  std::int32_t line_width = 0;  ///< 0 for no frame.
  std::uint32_t line_colour = 0;
};

struct Picture {
  TwipsRectangle place;
  std::int32_t width = 0;  ///< Both in pixels.
  std::int32_t height = 0;
  std::shared_ptr<const std::vector<std::uint8_t>> pixels;  ///< Red, green, blue, row by row from the top.
};

using PageItem = std::variant<TextRun, Box, Picture>;

struct Page {
  std::int32_t width = 0;
  std::int32_t height = 0;
  std::vector<PageItem> items;  ///< Later items are drawn over earlier ones.
};

/// Composes the pages of a document.
class PageSource {
 public:
  virtual ~PageSource() = default;
  [[nodiscard]] virtual std::size_t count() const noexcept = 0;
  [[nodiscard]] virtual Page compose(std::size_t index) const = 0;
};

/// The pages of a document, counted from 0. Each is composed anew whenever it is asked for.
class PageList {
 public:
  PageList() = default;
  explicit PageList(std::unique_ptr<const PageSource> source) noexcept : source_(std::move(source)) {}

  [[nodiscard]] std::size_t size() const noexcept { return source_ ? source_->count() : 0; }
  [[nodiscard]] bool empty() const noexcept { return size() == 0; }
  [[nodiscard]] Page operator[](std::size_t index) const { return source_->compose(index); }

 private:
  std::unique_ptr<const PageSource> source_;
};

/// The start of a report or of a part of it.
struct Bookmark {
  Text title;
  std::size_t page = 0;
  std::uint8_t level = 0;  ///< 0 for a report, 1 for a part of it.
};

struct Document {
  Text title;
  PageList pages;
  std::vector<Bookmark> bookmarks;
};

}  // namespace talutil
