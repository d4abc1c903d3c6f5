#include "controls/grid.hpp"

#include <algorithm>
#include <limits>

#include "automation/checked.hpp"
#include "controls/delimited_text.hpp"

namespace talutil {

namespace {

std::size_t checked_size(std::int32_t size, std::int32_t most) {
  if (size < 0) raise(ErrorNumber::invalid_procedure_call);
  if (size > most) raise(ErrorNumber::out_of_memory);
  return static_cast<std::size_t>(size);
}

std::int32_t checked_fixed(std::int32_t fixed, std::int32_t size) {
  if (fixed < 0 || fixed > size) raise(ErrorNumber::invalid_procedure_call);
  return fixed;
}

Grid::Format format_of(std::int16_t code) {
  const auto format = static_cast<Grid::Format>(code);
  if (format < Grid::Format::comma_text || format > Grid::Format::fixed_text) {
    raise(ErrorNumber::invalid_procedure_call);
  }
  return format;
}

constexpr char16_t separator_of(Grid::Format format) noexcept {
  return format == Grid::Format::tab_text ? u'\t' : u',';
}

bool is_true(TextView text, const Locale& locale) {
  if (equals_without_case(text, u"True")) return true;
  return text_to_number(text, locale).value_or(0) != 0;
}

}  // namespace

TextView RowText::cell(std::size_t column) const noexcept {
  if (column >= cells_.size()) return {};
  return TextView(units_).substr(cells_[column].start, cells_[column].length);
}

void RowText::set(std::size_t column, TextView text, std::size_t columns) {
  if (column >= cells_.size()) {
    if (text.empty()) return;
    cells_.reserve(columns);
    cells_.resize(column + 1);
  }
  Place& place = cells_[column];
  if (text.size() <= place.length) {
    std::ranges::copy(text, units_.begin() + place.start);
    unused_ += place.length - static_cast<std::uint32_t>(text.size());
    place.length = static_cast<std::uint32_t>(text.size());
  } else {
    if (text.size() > std::numeric_limits<std::uint32_t>::max() - units_.size()) raise(ErrorNumber::out_of_memory);
    const auto start = static_cast<std::uint32_t>(units_.size());
    make_room(text.size(), column + 1 == columns);
    units_ += text;
    unused_ += place.length;
    place = {start, static_cast<std::uint32_t>(text.size())};
  }
  if (unused_ > units_.size() / 2) tidy();
}

void RowText::make_room(std::size_t length, bool is_last) {
  const std::size_t needed = units_.size() + length;
  if (needed <= units_.capacity()) return;
  // A string that grows by itself doubles its room. Most rows are filled from left to right, once.
  Text larger;
  larger.reserve(is_last ? needed : needed + needed / 8);
  larger += units_;
  units_ = std::move(larger);
}

void RowText::keep(std::size_t columns) {
  if (columns >= cells_.size()) return;
  cells_.resize(columns);
  tidy();
}

void RowText::tidy() {
  // Allocate first: if that fails, the positions still match the old text.
  std::size_t used = 0;
  for (const Place& place : cells_) used += place.length;
  Text units;
  units.reserve(used);
  for (Place& place : cells_) {
    const TextView text = TextView(units_).substr(place.start, place.length);
    place.start = static_cast<std::uint32_t>(units.size());
    units += text;
  }
  units_ = std::move(units);
  unused_ = 0;
}

void Grid::keep_selection_inside() noexcept {
  row_ = std::min(row_, Rows() - 1);
  row_end_ = std::min(row_end_, Rows() - 1);
}

void Grid::put_Rows(std::int32_t rows) {
  rows_.resize(checked_size(rows, most_rows));
  fixed_rows_ = std::min(fixed_rows_, rows);
  keep_selection_inside();
}

void Grid::put_Cols(std::int32_t columns) {
  const std::size_t size = checked_size(columns, most_columns);
  if (size < columns_.size()) {
    for (TableRow& row : rows_) row.text.keep(size);
  }
  columns_.resize(size);
  fixed_columns_ = std::min(fixed_columns_, columns);
}

void Grid::put_FixedRows(std::int32_t rows) { fixed_rows_ = checked_fixed(rows, Rows()); }

void Grid::put_FixedCols(std::int32_t columns) { fixed_columns_ = checked_fixed(columns, Cols()); }

TextView Grid::cell_view(std::int32_t row, std::int32_t column) const {
  return rows_[index_in(rows_, row)].text.cell(index_in(columns_, column));
}

Text Grid::TextMatrix(std::int32_t row, std::int32_t column) const { return Text(cell_view(row, column)); }

void Grid::put_cell(std::int32_t row, std::int32_t column, TextView text) {
  rows_[index_in(rows_, row)].text.set(index_in(columns_, column), text, columns_.size());
}

Variant Grid::Cell(std::int16_t setting, std::int32_t row, std::int32_t column) const {
  Text text = TextMatrix(row, column);
  if (setting == text_setting) return text;
  if (setting != check_box_setting) raise(ErrorNumber::invalid_procedure_call);
  if (at(column).data_type != boolean_type) return no_check_box;
  return is_true(text, locale()) ? ticked : not_ticked;
}

void Grid::put_Cell(std::int16_t setting, std::int32_t row, std::int32_t column, const Variant& value) {
  if (setting == text_setting) return put_TextMatrix(row, column, value.to_text(locale()));
  if (setting != check_box_setting) raise(ErrorNumber::invalid_procedure_call);
  const std::int16_t state = value.to_int16(locale());
  if (state != ticked && state != not_ticked) raise(ErrorNumber::invalid_procedure_call);
  put_TextMatrix(row, column, state == ticked ? u"True" : u"False");
}

void Grid::put_Row(std::int32_t row) {
  put_RowSel(row);
  row_ = row;
}

void Grid::put_RowSel(std::int32_t row) {
  row_end_ = row == -1 ? row : static_cast<std::int32_t>(index_in(rows_, row));
}

void Grid::Clear() {
  for (TableRow& row : rows_) row.text = {};
}

void Grid::AddItem(const Text& item, std::int32_t index) {
  if (index < -1 || index > Rows()) raise(ErrorNumber::subscript_out_of_range);
  if (Rows() == most_rows) raise(ErrorNumber::out_of_memory);
  TableRow row;
  const TextView cells = item;
  std::size_t start = 0;
  for (std::size_t column = 0; column < columns_.size() && start <= cells.size(); ++column) {
    const std::size_t end = std::min(cells.find(u'\t', start), cells.size());
    row.text.set(column, cells.substr(start, end - start), columns_.size());
    start = end + 1;
  }
  const std::int32_t place = index == -1 ? Rows() : index;
  rows_.insert(rows_.begin() + place, std::move(row));
  if (place < fixed_rows_) ++fixed_rows_;
  for (std::int32_t* const end : {&row_, &row_end_}) {
    if (place <= *end) ++*end;
  }
}

void Grid::RemoveItem(std::int32_t index) {
  rows_.erase(rows_.begin() + static_cast<std::ptrdiff_t>(index_in(rows_, index)));
  if (index < fixed_rows_) --fixed_rows_;
  for (std::int32_t* const end : {&row_, &row_end_}) {
    if (index < *end) --*end;
  }
  keep_selection_inside();
}

void Grid::SaveGrid(const Text& file, std::int16_t format_code, Boolean fixed_cells) const {
  const Format format = format_of(format_code);
  const auto first_row = static_cast<std::size_t>(fixed_cells ? 0 : fixed_rows_);
  const auto first_column = static_cast<std::size_t>(fixed_cells ? 0 : fixed_columns_);
  std::vector<std::size_t> widths(columns_.size());
  bool is_wide = false;
  for (std::size_t r = first_row; r < rows_.size(); ++r) {
    for (std::size_t c = first_column; c < columns_.size(); ++c) {
      const TextView text = rows_[r].text.cell(c);
      is_wide = is_wide || !code_page_.holds(text);
      widths[c] = std::max(widths[c], text.size());
    }
  }

  TableFile output(files_, code_page_, file, is_wide);
  Text line;
  for (std::size_t r = first_row; r < rows_.size(); ++r) {
    line.clear();
    for (std::size_t c = first_column; c < columns_.size(); ++c) {
      const TextView text = rows_[r].text.cell(c);
      if (format == Format::fixed_text) {
        line += text;
        std::replace_if(
            line.end() - static_cast<std::ptrdiff_t>(text.size()), line.end(),
            [](char16_t unit) { return unit == u'\r' || unit == u'\n'; }, u' ');
        if (c + 1 < columns_.size()) line.append(widths[c] - text.size() + 2, u' ');
      } else {
        if (c != first_column) line += separator_of(format);
        append_delimited(line, text, separator_of(format));
      }
    }
    output.write(line += u"\r\n");
  }
  output.close();
}

void Grid::LoadGrid(const Text& file, std::int16_t format_code, Boolean fixed_cells) {
  const Format format = format_of(format_code);
  const Text text = read_table_file(files_, code_page_, file);
  const auto rows = format == Format::fixed_text ? read_fixed(text) : read_delimited(text, separator_of(format));

  const auto first_row = static_cast<std::size_t>(fixed_cells ? 0 : fixed_rows_);
  const auto first_column = static_cast<std::size_t>(fixed_cells ? 0 : fixed_columns_);
  std::size_t width = 0;
  for (const auto& row : rows) width = std::max(width, row.size());
  const std::size_t columns = first_column + width;
  if (first_row + rows.size() > most_rows || columns > most_columns) raise(ErrorNumber::out_of_memory);

  // Built separately and then swapped in, so that the old table survives if memory runs out.
  std::vector<Column> new_columns = columns_;
  new_columns.resize(columns);
  std::vector<TableRow> new_rows(rows_.begin(), rows_.begin() + static_cast<std::ptrdiff_t>(first_row));
  new_rows.reserve(first_row + rows.size());
  for (TableRow& row : new_rows) row.text.keep(columns);
  for (const std::vector<Text>& cells : rows) {
    RowText& row = new_rows.emplace_back().text;
    if (first_column > 0 && new_rows.size() <= rows_.size()) row = rows_[new_rows.size() - 1].text;
    row.keep(first_column);
    for (std::size_t c = 0; c < cells.size(); ++c) row.set(first_column + c, cells[c], columns);
  }
  columns_.swap(new_columns);
  rows_.swap(new_rows);
  fixed_rows_ = std::min(fixed_rows_, Rows());
  fixed_columns_ = std::min(fixed_columns_, Cols());
  // The selection is gone, except for rows that remain.
  row_ = std::min(row_, static_cast<std::int32_t>(first_row) - 1);
  row_end_ = std::min(row_end_, static_cast<std::int32_t>(first_row) - 1);
}

}  // namespace talutil
