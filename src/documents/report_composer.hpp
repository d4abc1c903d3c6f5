#pragma once

#include <optional>

#include "automation/numbers.hpp"
#include "documents/font_metrics.hpp"
#include "platform/page_model.hpp"

namespace talutil {

class GridContents;

/// The paper, and what appears on every page. Lengths are in twips.
struct PageSetup {
  std::int32_t width = 0;
  std::int32_t height = 0;
  std::int32_t margin_left = 0;
  std::int32_t margin_top = 0;
  std::int32_t margin_right = 0;
  std::int32_t margin_bottom = 0;
  /// Above the top margin, on every page. A long header takes more lines, then smaller letters; only if it does not fit
  /// in letters of 6 points is its middle left out.
  Text header;
  FontStyle header_font;
  std::optional<FontStyle> footer_font;  ///< If none, that of the header.
  bool has_rule = true;                  ///< A rule below the header.
  /// On the left, below the bottom margin; the page number is on the right, the columns of a divided grid in the
  /// middle.
  Text footer;
  bool wraps_words = true;

  [[nodiscard]] std::int32_t room() const noexcept { return width - margin_left - margin_right; }
  [[nodiscard]] std::int32_t bottom() const noexcept { return height - margin_bottom; }
};

/// A paper size by the platform's code, in portrait orientation, in twips; A4 for an unknown code.
struct PaperSize {
  std::int32_t code;
  std::int32_t width;
  std::int32_t height;
};
[[nodiscard]] const PaperSize& paper_size(std::int32_t code) noexcept;

/// Lays out a report on pages, starting at the top of the first.
class ReportComposer {
 public:
  ReportComposer(FontMetrics& metrics, PageSetup setup);

  /// Adds flowing text, in paragraphs. Lines are broken between words (or within a word that is longer than a line).
  /// Tab stops are eight characters apart; a form feed begins a new page; other control characters are shown as "^A".
  /// If the text does not end with a line end, the next text still starts on a new line.
  void add_text(TextView text, const FontStyle& font);

  /// Adds a text in a box, clipped at its edges. The box may be anywhere and never begins a new page.
  void add_text_box(TextView text, const TwipsRectangle& place, const FontStyle& font);

  /// Adds a grid as it appears. Long texts are wrapped if the grid wraps them, otherwise cut off. Fixed rows are
  /// repeated on every page. Columns that do not fit continue on separate pages after the last row, behind the fixed
  /// columns; these pages say which columns they show.
  void add_grid(const GridContents& grid);

  /// Adds a picture, reduced to fit on the page.
  void add_picture(Picture picture);

  /// Adds headers and footers to every page and returns the document.
  [[nodiscard]] Document finish();

 private:
  struct GridLayout;

  /// The header as it fits above the top margin.
  struct HeaderLines {
    FontStyle font;
    std::vector<Text> lines;
    bool is_right_to_left = false;
  };
  struct LineLook {
    std::uint32_t colour = 0;
    bool is_right_to_left = false;  ///< As the paragraph is.
  };
  struct FontRun {
    TextView text;
    FontStyle style;
    bool is_wide = false;
    bool is_named_font = false;
  };

  Page& page() { return document_.pages.back(); }
  void begin_page();
  void begin_part(const GridLayout& layout, std::size_t part);
  void add_line(TextView line, const FontStyle& font, bool is_right_to_left);
  std::int32_t add_runs(TextView text, std::int32_t left, std::int32_t top, const FontStyle& font,
                        const LineLook& look);
  [[nodiscard]] FontRun first_font_run(TextView text, const FontStyle& font);
  double add_part(TextView text, double x, std::int32_t top, const FontStyle& font, std::uint32_t colour);
  double add_reversed_part(TextView text, double left, std::int32_t top, const FontStyle& font, std::uint32_t colour);
  void add_paragraph(TextView text, const FontStyle& font);
  [[nodiscard]] double after_tab(double x, const FontStyle& font);
  [[nodiscard]] TextView fitting(TextView text, double room, const FontStyle& font);
  [[nodiscard]] TextView take_line(TextView& text, double room, const FontStyle& font);
  [[nodiscard]] std::vector<Text> lines_of(TextView text, const FontStyle& font);
  [[nodiscard]] HeaderLines header_lines();
  void add_check_box(bool is_ticked, const TwipsRectangle& place, const FontStyle& font);
  void add_cell(const GridLayout& layout, std::size_t row, std::size_t column, const TwipsRectangle& place);
  void set_row_heights(GridLayout& layout);
  void add_row(const GridLayout& layout, std::size_t row, std::size_t part);
  void add_header(const HeaderLines& header);
  void add_footer(std::size_t page_index);

  FontMetrics& metrics_;
  PageSetup setup_;
  Document document_;
  std::vector<Text> notes_;  ///< For the footer of each page.
  Text note_;                ///< For the footers of pages that begin now.
  std::int32_t y_ = 0;
};

}  // namespace talutil
