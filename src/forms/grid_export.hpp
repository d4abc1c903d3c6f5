#pragma once

#include "automation/control.hpp"

namespace talutil {

class Grid;

/// Copies what a grid shows into a table and saves that as comma text. Hidden rows and columns are left out. Grids are
/// driven in a fixed order; the source is only read.
class GridExport {
 public:
  /// Empties the table and gives it a column for each that the grid shows.
  GridExport(const Control& grid, const Control& table);
  GridExport(const GridExport&) = delete;
  GridExport& operator=(const GridExport&) = delete;

  /// Empties our own table again: it lives on, and an export can be large.
  ~GridExport();

  /// From a row, counted from 0, to the last one.
  void copy_all_rows(std::int32_t first);

  /// The rows between Row and RowSel, whichever is the smaller.
  void copy_selected_rows();

  /// Raises what the file raises; the file is then as it was.
  void save(const Text& file, bool with_fixed_cells) const;

 private:
  void copy_rows(std::int32_t first, std::int32_t last);

  const Control& grid_;
  const Control& table_;
  Grid* own_table_;  ///< The table, where it is our own grid: cells go into it without detour. Else null.
  std::int32_t copied_ = 0;
};

}  // namespace talutil
