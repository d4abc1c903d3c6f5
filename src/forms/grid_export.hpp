#pragma once

#include <vector>

#include "automation/control.hpp"
#include "platform/platform.hpp"

namespace talutil {

class Grid;

/// Copies the visible cells of a grid to a table and saves that as comma-separated text. Hidden rows and columns are
/// left out. Members of the grids are called in a fixed order; the source is only read. Nobody reads the cells of a
/// table that is our own grid, so they are not copied to that: rows are put straight into the form that they have in
/// the file.
class GridExport {
 public:
  /// Clears the table and gives it one column per visible column of the grid.
  GridExport(const Platform& platform, const Control& grid, const Control& table);
  GridExport(const GridExport&) = delete;
  GridExport& operator=(const GridExport&) = delete;

  /// Clears our own table: it lives on.
  ~GridExport();

  /// Copies from a row, counted from 0, to the last one.
  void copy_all_rows(std::int32_t first);

  /// Copies the rows from Row to RowSel, in either order.
  void copy_selected_rows();

  /// Raises the errors of writing a file; an existing file then stays as it was.
  void save(const Text& file, bool with_fixed_cells);

 private:
  void copy_rows(std::int32_t first, std::int32_t last);
  void add_cell(std::int32_t column, TextView text);
  void end_row(std::int32_t cells);
  void end_block();
  void save_blocks(const Text& file);

  Platform platform_;
  const Control& grid_;
  const Control& table_;
  Grid* own_table_;           ///< The table if it is our own grid; otherwise null.
  std::int32_t columns_ = 0;  ///< Of the table.
  std::int32_t copied_ = 0;
  // For our own table: the rows as lines, in blocks so that they are not moved as they grow.
  std::vector<Text> blocks_;
  Text block_;
  bool is_wide_ = false;  ///< The code page lacks a character of some block.
};

}  // namespace talutil
