#include "forms/grid_export.hpp"

#include <algorithm>

#include "automation/checked.hpp"
#include "automation/control.hpp"
#include "automation/run_time_error.hpp"
#include "controls/delimited_text.hpp"
#include "controls/grid.hpp"

namespace talutil {

GridExport::GridExport(const Platform& platform, const Control& grid, const Control& table)
    : platform_(platform), grid_(grid), table_(table), own_table_(dynamic_cast<Grid*>(table.object().get())) {
  table_.put(u"Rows", std::int32_t{0});
  table_.put(u"Cols", std::int32_t{0});
  const auto columns = grid_.get<std::int32_t>(u"Cols");
  for (std::int32_t c = 0; c < columns; ++c) {
    if (!grid_.get<Boolean>(u"ColHidden", {c})) table_.put(u"Cols", ++columns_);
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
      add_cell(k, cell.run_text(grid_.locale()));
      ++k;
    }
    end_row(k);
    ++copied_;
  }
}

void GridExport::add_cell(std::int32_t column, TextView text) {
  if (own_table_ == nullptr) return table_.put(u"TextMatrix", {copied_, column}, text);
  if (column == columns_) raise(ErrorNumber::subscript_out_of_range);
  if (column > 0) block_ += u',';
  append_delimited(block_, text, u',');
}

/// A grid may hide more columns while it is read; these are empty cells.
void GridExport::end_row(std::int32_t cells) {
  constexpr std::size_t block_length = 1U << 16U;
  if (own_table_ == nullptr) return;
  for (std::int32_t c = std::max(cells, 1); c < columns_; ++c) block_ += u',';
  block_ += u"\r\n";
  if (block_.size() >= block_length) end_block();
}

void GridExport::end_block() {
  is_wide_ = is_wide_ || !platform_.code_page.holds(block_);
  blocks_.push_back(block_);
  block_.clear();
}

void GridExport::save(const Text& file, bool with_fixed_cells) {
  constexpr std::int16_t comma_text = 3;
  if (own_table_ != nullptr) return save_blocks(file);
  table_.call(u"SaveGrid", {file, comma_text, Boolean(with_fixed_cells)});
}

void GridExport::save_blocks(const Text& file) {
  end_block();
  TableFile output(platform_.files, platform_.code_page, file, is_wide_);
  for (const Text& block : blocks_) output.write(block);
  output.close();
}

}  // namespace talutil
