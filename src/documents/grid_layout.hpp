#pragma once

#include <vector>

#include "documents/grid_contents.hpp"
#include "documents/page_setup.hpp"
#include "documents/text_lines.hpp"

namespace talutil {

/// A grid as a report shows it: how its columns and rows are divided among pages, and how they are drawn there.
class GridLayout {
 public:
  /// A half-open range of columns that stand next to each other on a page, behind the repeated ones.
  struct Part {
    std::size_t first = 0;
    std::size_t end = 0;
  };

  GridLayout(GridContents contents, const PageSetup& setup, FontMetrics& metrics);

  [[nodiscard]] const GridContents& grid() const noexcept { return grid_; }
  [[nodiscard]] const std::vector<Part>& parts() const noexcept { return parts_; }

  /// The height of a row, the same on every page: as the grid specifies, or as its longest text needs.
  [[nodiscard]] std::int32_t height(std::size_t row) const { return heights_[row]; }

  /// The height of all heading rows.
  [[nodiscard]] std::int32_t heading_height() const;

  /// Draws a row of a part on a page, where equal headings of rows and columns that merge are a single cell.
  void draw_row(Page& page, std::size_t row, std::size_t part, std::int32_t left, std::int32_t top,
                FontMetrics& metrics) const;

 private:
  class CellWriter;

  void divide_columns(std::int32_t room);
  void set_heights(std::int32_t most, FontMetrics& metrics);
  [[nodiscard]] bool continues_down(std::size_t below, std::size_t column) const;

  GridContents grid_;
  std::vector<std::int32_t> widths_;
  std::vector<std::int32_t> heights_;
  std::size_t repeated_ = 0;  ///< The leading columns that stand on every page.
  std::vector<Part> parts_;
};

}  // namespace talutil
