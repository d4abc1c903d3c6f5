#pragma once

#include <optional>

#include "platform/table_source.hpp"
#include "platform/win32/dots.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// A table on a window: the system's list view, which asks a table source for the visible cells.
class ListView {
 public:
  explicit ListView(HWND window) : window_(window), dots_(dots_per_inch(window)) {}

  /// Shows a table instead of the previous one.
  /// @param bar_column a column of percentages to be drawn as bars; -1 for none
  void show(TableSource& table, std::int32_t bar_column);

  /// Gives the width that the other columns leave to the last one.
  void fill_width() const;

  /// Scales the columns after the window has come to a monitor with other dots per inch.
  void follow_dots(int dots) {
    dots_ = dots;
    if (table_ != nullptr) show(*table_, bar_column_);
  }

  /// The window is about to close; notifies the table.
  void close();

  void select_all() const;

  /// The selected rows as text, with tabs between cells and a line end after each row.
  [[nodiscard]] Text selected_rows() const;

  /// Handles a notification of the list view; returns nothing to leave it to the system.
  [[nodiscard]] std::optional<LRESULT> answer(NMHDR& notice) const;

 private:
  void draw_bar(HDC device, std::int32_t row) const;
  [[nodiscard]] int dots_of(std::int32_t column) const;

  HWND window_;
  int dots_;
  TableSource* table_ = nullptr;
  std::int32_t bar_column_ = -1;
};

}  // namespace talutil::win32
