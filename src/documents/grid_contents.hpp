#pragma once

#include <map>
#include <optional>
#include <vector>

#include "automation/control.hpp"
#include "documents/font_metrics.hpp"
#include "documents/text_store.hpp"

namespace talutil {

enum class Alignment : std::uint8_t { left, centre, right, general };

/// How a cell looks.
struct CellLook {
  bool is_bold = false;
  std::uint32_t letters = 0;
  std::optional<std::uint32_t> background;
  Alignment alignment = Alignment::general;
  friend auto operator<=>(const CellLook&, const CellLook&) = default;
};

/// The contents and the appearance of a grid: read once, completely, before the first cell is laid out. Appearance that
/// the grid does not answer, or answers with an error, is the usual one. Hidden rows and columns are left out. Kept for
/// as long as the document, so a cell takes only its text and four bytes, unless cells of its row look unlike others.
class GridContents {
 public:
  struct Column {
    std::int32_t index = 0;  ///< In the grid.
    std::int32_t width = 0;  ///< In twips.
    bool is_boolean = false;
    bool merges = false;  ///< Equal headings below each other are one.
    Alignment alignment = Alignment::general;
  };
  struct Row {
    std::int32_t height = 0;  ///< 0 for a row as high as its text.
    bool merges = false;      ///< Equal headings next to each other are one.
  };
  struct Cell {
    /// Without control characters, except for line feeds if the grid wraps texts; Arabic letters joined.
    TextView text;
    bool is_ticked = false;
    const CellLook& look;
  };
  /// The lines around cells; none for no lines.
  using Lines = std::optional<std::uint32_t>;

  GridContents(const Control& grid, const FontStyle& usual_font);

  FontStyle font;
  bool wraps = false;
  Lines lines;
  Lines heading_lines;
  std::vector<Column> columns;
  std::vector<Row> rows;
  std::size_t heading_rows = 0;  ///< The first rows.
  std::size_t heading_columns = 0;

  [[nodiscard]] Cell cell(std::size_t row, std::size_t column) const;
  [[nodiscard]] bool is_heading(std::size_t row, std::size_t column) const noexcept {
    return row < heading_rows || column < heading_columns;
  }
  [[nodiscard]] bool is_check_box(std::size_t row, std::size_t column) const {
    return row >= heading_rows && columns[column].is_boolean;
  }
  [[nodiscard]] FontStyle font_of(const CellLook& look) const {
    FontStyle style = font;
    style.is_bold = look.is_bold;
    return style;
  }

 private:
  class CellLooks;
  /// Where the cells of a row are kept.
  struct StoredRow {
    const char16_t* units = nullptr;  ///< Their texts, one after the other; a ticked check box has one character.
    std::size_t looks = usual_looks;  ///< Of its first cell in `row_looks_`.
  };
  static constexpr std::size_t usual_looks = static_cast<std::size_t>(-1);

  void read_columns(const Control& grid);
  void read_rows(const Control& grid);
  void read_cells(const Control& grid, RepeatedUse& text, std::int32_t row, CellLooks& looks);
  void set_usual_looks(const Control& grid);
  void keep_looks(const std::vector<CellLook>& looks);
  [[nodiscard]] const CellLook& usual_look(std::size_t row, std::size_t column) const {
    return usual_looks_[column * 2 + (is_heading(row, column) ? 1 : 0)];
  }

  TextStore texts_;
  std::vector<StoredRow> stored_rows_;
  std::vector<std::uint32_t> ends_;    ///< Where the text of each cell ends in its row, row by row.
  std::vector<CellLook> usual_looks_;  ///< Two a column: of its cells, and of its headings.
  std::vector<CellLook> looks_;        ///< Those that single cells have.
  std::vector<std::uint32_t> row_looks_;
  std::map<CellLook, std::uint32_t> known_looks_;
};

}  // namespace talutil
