#pragma once

#include <memory>

#include "documents/report_pages.hpp"

namespace talutil {

/// Lays out a report on pages, starting at the top of the first.
class ReportComposer {
 public:
  /// @param metrics must outlive the composer and its document
  ReportComposer(std::shared_ptr<FontMetrics> metrics, PageSetup setup);

  /// Adds flowing text, in paragraphs. Lines are broken between words (or within a word that is longer than a line).
  /// Tab stops are eight characters apart; a form feed begins a new page; other control characters are shown as "^A".
  /// If the text does not end with a line end, the next text still starts on a new line.
  void add_text(TextView text, const FontStyle& font);

  /// Adds a text in a box, clipped at its edges. The box may be anywhere and never begins a new page.
  void add_text_box(TextView text, const TwipsRectangle& place, const FontStyle& font);

  /// Adds a grid as it appears. Long texts are wrapped if the grid wraps them, otherwise cut off. Fixed rows are
  /// repeated on every page. Columns that do not fit continue on separate pages after the last row, behind the fixed
  /// columns; these pages say which columns they show.
  void add_grid(GridContents grid);

  /// Adds a picture, reduced to fit on the page.
  void add_picture(Picture picture);

  /// Returns the document, in which every page has the header and its footer.
  [[nodiscard]] Document finish();

 private:
  [[nodiscard]] const PageSetup& setup() const noexcept { return pages_->setup(); }
  void begin_page();
  void begin_part(const GridLayout& layout, std::size_t part);
  void add_line(TextView line, const FontStyle& font, bool is_right_to_left);
  void add_paragraph(TextView text, const FontStyle& font);
  void add_part(const GridLayout& layout, std::size_t part);

  FontMetrics& metrics_;
  std::unique_ptr<ReportPages> pages_;
  Document document_;
  std::int32_t y_ = 0;
};

}  // namespace talutil
