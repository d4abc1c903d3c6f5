#pragma once

#include <optional>

#include "platform/table_source.hpp"
#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// A table of a window: the system's list view over a table source, which is asked for what comes into sight.
class ListView {
 public:
  explicit ListView(HWND window) noexcept : window_(window) {}

  /// Shows a table, in place of the one before.
  /// @param bar_column a column of percentages to be drawn as bars; -1 for none
  void show(TableSource& table, std::int32_t bar_column);

  /// The window is about to go: the table hears that it has none.
  void close();

  void select_all() const;

  /// The selected rows as text, with tabs between the cells and a line end behind each row.
  [[nodiscard]] Text selected_rows() const;

  /// Answers a notice of the list view; nothing leaves it to the system.
  [[nodiscard]] std::optional<LRESULT> answer(NMHDR& notice) const;

 private:
  void draw_bar(HDC device, std::int32_t row) const;

  HWND window_;
  TableSource* table_ = nullptr;
  std::int32_t bar_column_ = -1;
};

}  // namespace talutil::win32
