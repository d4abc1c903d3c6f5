#pragma once

#include <cstdint>

#include "automation/text.hpp"

namespace talutil {

/// What a table on a window shows: rows of texts below a heading. Rows and columns are counted from 0.
class TableSource {
 public:
  virtual ~TableSource() = default;

  [[nodiscard]] virtual std::int32_t row_count() const = 0;  ///< Without the heading.
  [[nodiscard]] virtual std::int32_t column_count() const = 0;

  /// The heading of a column; empty where the table has none.
  [[nodiscard]] virtual Text heading(std::int32_t column) const = 0;
  [[nodiscard]] virtual std::int32_t column_width(std::int32_t column) const = 0;  ///< In twips.
  [[nodiscard]] virtual Text cell_text(std::int32_t row, std::int32_t column) const = 0;

  /// The window that shows the table from now on; 0 when it is gone.
  virtual void set_window(std::int32_t window) = 0;
};

}  // namespace talutil
