#pragma once

#include "automation/control.hpp"

namespace talutil {

class Grid;

/// Copies the visible cells of a grid to a table and saves that as comma-separated text. Hidden rows and columns are
/// left out. Members of the grids are called in a fixed order; the source is only read.
class GridExport {
 public:
  /// Clears the table and gives it one column per visible column of the grid.
  GridExport(const Control& grid, const Control& table);
  GridExport(const GridExport&) = delete;
  GridExport& operator=(const GridExport&) = delete;

  /// Clears our own table: it lives on, and an export can be large.
  ~GridExport();

  /// Copies from a row, counted from 0, to the last one.
  void copy_all_rows(std::int32_t first);

  /// Copies the rows from Row to RowSel, in either order.
  void copy_selected_rows();

  /// Raises the errors of writing a file; an existing file then stays as it was.
  void save(const Text& file, bool with_fixed_cells) const;

 private:
  void copy_rows(std::int32_t first, std::int32_t last);

  const Control& grid_;
  const Control& table_;
  Grid* own_table_;  ///< The table if it is our own grid, for direct access to cells; otherwise null.
  std::int32_t copied_ = 0;
};

}  // namespace talutil
