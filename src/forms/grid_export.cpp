#include "forms/grid_export.hpp"

#include <algorithm>

#include "automation/checked.hpp"

namespace talutil {

GridExport::GridExport(const Control& grid, const Control& table) : grid_(grid), table_(table) {
  table_.put(u"Rows", std::int32_t{0});
  table_.put(u"Cols", std::int32_t{0});
  const auto columns = grid_.get<std::int32_t>(u"Cols");
  std::int32_t shown = 0;
  for (std::int32_t c = 0; c < columns; ++c) {
    if (!grid_.get<Boolean>(u"ColHidden", {c})) table_.put(u"Cols", ++shown);
  }
}

void GridExport::copy_all_rows(std::int32_t first) {
  copy_rows(first, checked_subtract(grid_.get<std::int32_t>(u"Rows"), 1));
}

void GridExport::copy_selected_rows() {
  const auto row = grid_.get<std::int32_t>(u"Row");
  const auto other = grid_.get<std::int32_t>(u"RowSel");
  copy_rows(std::min(row, other), std::max(row, other));
}

void GridExport::copy_rows(std::int32_t first, std::int32_t last) {
  for (std::int64_t at = first; at <= last; ++at) {
    const auto r = static_cast<std::int32_t>(at);
    if (grid_.get<Boolean>(u"RowHidden", {r})) continue;
    table_.put(u"Rows", copied_ + 1);
    const auto columns = grid_.get<std::int32_t>(u"Cols");
    std::int32_t k = 0;
    for (std::int32_t c = 0; c < columns; ++c) {
      if (grid_.get<Boolean>(u"ColHidden", {c})) continue;
      table_.put(u"TextMatrix", {copied_, k}, grid_.get(u"TextMatrix", {r, c}));
      ++k;
    }
    ++copied_;
  }
}

void GridExport::save(const Text& file, bool with_fixed_cells) const {
  constexpr std::int16_t comma_text = 3;
  table_.call(u"SaveGrid", {file, comma_text, Boolean(with_fixed_cells)});
}

}  // namespace talutil
