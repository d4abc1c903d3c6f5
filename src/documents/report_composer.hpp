#pragma once

#include "automation/control.hpp"
#include "documents/font_metrics.hpp"
#include "platform/page_model.hpp"

namespace talutil {

/// The paper and what stands on every page. Lengths are twips.
struct PageSetup {
  std::int32_t width = 0;
  std::int32_t height = 0;
  std::int32_t margin_left = 0;
  std::int32_t margin_top = 0;
  std::int32_t margin_right = 0;
  std::int32_t margin_bottom = 0;
  Text header;  ///< Above the top margin, on every page.
  FontStyle header_font;
  bool has_rule = true;  ///< A rule below the header.
  Text footer;           ///< Left, below the bottom margin; the page's number stands right.
  bool wraps_words = true;

  [[nodiscard]] std::int32_t room() const noexcept { return width - margin_left - margin_right; }
  [[nodiscard]] std::int32_t bottom() const noexcept { return height - margin_bottom; }
};

/// A size of paper by the platform's code, upright, in twips; A4 for a code that is not known.
struct PaperSize {
  std::int32_t code;
  std::int32_t width;
  std::int32_t height;
};
[[nodiscard]] const PaperSize& paper_size(std::int32_t code) noexcept;

/// Lays a report out on pages, from the top of the first one on.
class ReportComposer {
 public:
  ReportComposer(FontMetrics& metrics, PageSetup setup);

  /// Flowing text, in paragraphs. Lines break between words (or within one that is longer than a line), at tabs of
  /// eight characters; a form feed begins a new page, other control characters are shown as "^A". A text that does not
  /// end a line is followed by the next one on a line of its own.
  void add_text(TextView text, const FontStyle& font);

  /// A text in a box, cut off at its edges, wherever the box lies: no page is begun for it.
  void add_text_box(TextView text, const TwipsRectangle& place, const FontStyle& font);

  /// A grid as it looks: the rows and columns that it shows, widths, heights, alignments, fonts and colours where it
  /// answers for them; long texts in more lines where it wraps them, else cut off. Its fixed rows stand on top of every
  /// page; columns that do not fit follow on pages of their own.
  void add_grid(const Control& grid, const FontStyle& font);

  /// A picture, made smaller where it is larger than the page's room.
  void add_picture(Picture picture);

  void begin_section(Text title);

  /// Puts headers and footers on every page and gives the document.
  [[nodiscard]] Document finish();

 private:
  struct GridLayout;

  Page& page() { return document_.pages.back(); }
  void begin_page();
  void add_line(TextView line, const FontStyle& font);
  std::int32_t add_runs(TextView text, std::int32_t left, std::int32_t top, const FontStyle& font);
  void add_paragraph(TextView text, const FontStyle& font);
  [[nodiscard]] double after_tab(double x, const FontStyle& font);
  [[nodiscard]] TextView fitting(TextView text, double room, const FontStyle& font);
  [[nodiscard]] TextView take_line(TextView& text, double room, const FontStyle& font);
  void add_cell(const GridLayout& layout, std::size_t row, std::size_t column, const TwipsRectangle& place);
  [[nodiscard]] std::vector<std::int32_t> row_heights(const GridLayout& layout);
  void add_row(const GridLayout& layout, std::size_t row, std::int32_t height, std::size_t first, std::size_t end);

  FontMetrics& metrics_;
  PageSetup setup_;
  Document document_;
  std::int32_t y_ = 0;
};

}  // namespace talutil
