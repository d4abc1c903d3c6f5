#pragma once

#include <cstdint>

#include "automation/text.hpp"

namespace talutil {

/// The contents of a table on a window: rows of text below a heading. Rows and columns are counted from 0.
class TableSource {
 public:
  virtual ~TableSource() = default;

  [[nodiscard]] virtual std::int32_t row_count() const = 0;  ///< Not counting the heading.
  [[nodiscard]] virtual std::int32_t column_count() const = 0;

  /// The heading of a column; empty if the table has none.
  [[nodiscard]] virtual Text heading(std::int32_t column) const = 0;
  [[nodiscard]] virtual std::int32_t column_width(std::int32_t column) const = 0;  ///< In twips.
  [[nodiscard]] virtual bool is_right_aligned(std::int32_t column) const = 0;
  [[nodiscard]] virtual Text cell_text(std::int32_t row, std::int32_t column) const = 0;

  /// The window that now shows the table; 0 once it is closed.
  virtual void set_window(std::int32_t window) = 0;
};

}  // namespace talutil
