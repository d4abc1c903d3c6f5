#pragma once

#include <optional>
#include <vector>

#include "automation/control.hpp"
#include "documents/font_metrics.hpp"

namespace talutil {

enum class Alignment : std::uint8_t { left, centre, right, general };

/// How a cell looks.
struct CellLook {
  bool is_bold = false;
  std::uint32_t letters = 0;
  std::optional<std::uint32_t> background;
  Alignment alignment = Alignment::general;
  friend bool operator==(const CellLook&, const CellLook&) = default;
};

/// The contents and the appearance of a grid: read once, completely, before the first cell is laid out. Appearance that
/// the grid does not answer, or answers with an error, is the usual one. Hidden rows and columns are left out.
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
    Text text;  ///< Without control characters, except for line feeds if the grid wraps texts; Arabic letters joined.
    bool is_ticked = false;
    std::uint32_t look = 0;
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

  [[nodiscard]] const Cell& cell(std::size_t row, std::size_t column) const {
    return cells_[row * columns.size() + column];
  }
  [[nodiscard]] const CellLook& look(const Cell& cell) const { return looks_[cell.look]; }
  [[nodiscard]] bool is_heading(std::size_t row, std::size_t column) const noexcept {
    return row < heading_rows || column < heading_columns;
  }
  [[nodiscard]] bool is_check_box(std::size_t row, std::size_t column) const {
    return row >= heading_rows && columns[column].is_boolean;
  }
  [[nodiscard]] FontStyle font_of(const Cell& cell) const {
    FontStyle style = font;
    style.is_bold = look(cell).is_bold;
    return style;
  }

 private:
  class CellLooks;

  void read_columns(const Control& grid);
  void read_rows(const Control& grid);
  [[nodiscard]] std::uint32_t place_of(const CellLook& look);

  std::vector<Cell> cells_;  ///< Row by row.
  std::vector<CellLook> looks_;
};

}  // namespace talutil
