#include "forms/grid_export.hpp"

#include <algorithm>

#include "automation/checked.hpp"
#include "automation/control.hpp"
#include "controls/grid.hpp"

namespace talutil {

GridExport::GridExport(const Control& grid, const Control& table)
    : grid_(grid), table_(table), own_table_(dynamic_cast<Grid*>(table.object().get())) {
  table_.put(u"Rows", std::int32_t{0});
  table_.put(u"Cols", std::int32_t{0});
  const auto columns = grid_.get<std::int32_t>(u"Cols");
  std::int32_t shown = 0;
  for (std::int32_t c = 0; c < columns; ++c) {
    if (!grid_.get<Boolean>(u"ColHidden", {c})) table_.put(u"Cols", ++shown);
  }
}

GridExport::~GridExport() {
  if (own_table_ != nullptr) own_table_->put_Rows(0);
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
  // Looked up only when the first row is copied, because a grid may lack members that an export never reads.
  std::unique_ptr<RepeatedUse> row_hidden;
  std::unique_ptr<RepeatedUse> column_hidden;
  std::unique_ptr<RepeatedUse> text;
  const auto use = [&](std::unique_ptr<RepeatedUse>& member, TextView name,
                       std::initializer_list<Variant> indexes) -> RepeatedUse& {
    if (!member) member = grid_.repeated_get(name, indexes);
    return *member;
  };
  for (std::int64_t at = first; at <= last; ++at) {
    const auto r = static_cast<std::int32_t>(at);
    RepeatedUse& hidden_row = use(row_hidden, u"RowHidden", {r});
    hidden_row.set(0, r);
    if (hidden_row.run_truth(grid_.locale())) continue;
    table_.put(u"Rows", copied_ + 1);
    const auto columns = grid_.get<std::int32_t>(u"Cols");
    std::int32_t k = 0;
    for (std::int32_t c = 0; c < columns; ++c) {
      RepeatedUse& hidden_column = use(column_hidden, u"ColHidden", {c});
      hidden_column.set(0, c);
      if (hidden_column.run_truth(grid_.locale())) continue;
      RepeatedUse& cell = use(text, u"TextMatrix", {r, c});
      cell.set(0, r);
      cell.set(1, c);
      const TextView shown = cell.run_text(grid_.locale());
      if (own_table_ != nullptr)
        own_table_->put_cell(copied_, k, shown);
      else
        table_.put(u"TextMatrix", {copied_, k}, shown);
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
