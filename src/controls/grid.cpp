#include "controls/grid.hpp"

#include <algorithm>

#include "automation/checked.hpp"
#include "controls/delimited_text.hpp"

namespace talutil {

namespace {

constexpr Text::size_type length_units = 2;

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

bool is_true(TextView text) {
  if (equals_without_case(text, u"True")) return true;
  return text_to_number(text).value_or(0) != 0;
}

}  // namespace

void CellText::set(TextView text) {
  if (text.empty()) return units_.reset();
  auto units = std::make_unique_for_overwrite<char16_t[]>(length_units + text.size());
  units[0] = static_cast<char16_t>(text.size() & 0xFFFF);
  units[1] = static_cast<char16_t>(text.size() >> 16);
  std::ranges::copy(text, units.get() + length_units);
  units_ = std::move(units);
}

TextView CellText::view() const noexcept {
  if (!units_) return {};
  return {units_.get() + length_units, units_[0] | static_cast<std::size_t>(units_[1]) << 16};
}

TextView Grid::cell(std::size_t row, std::size_t column) const noexcept {
  const std::vector<CellText>& cells = rows_[row].cells;
  return column < cells.size() ? cells[column].view() : TextView();
}

void Grid::fill(TableRow& row, std::size_t column, TextView text) const {
  if (column >= row.cells.size()) {
    if (text.empty()) return;
    // The whole row at once: it is mostly filled from its beginning to its end.
    row.cells.reserve(columns_.size());
    row.cells.resize(column + 1);
  }
  row.cells[column].set(text);
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
    for (TableRow& row : rows_) row.cells.resize(std::min(row.cells.size(), size));
  }
  columns_.resize(size);
  fixed_columns_ = std::min(fixed_columns_, columns);
}

void Grid::put_FixedRows(std::int32_t rows) { fixed_rows_ = checked_fixed(rows, Rows()); }

void Grid::put_FixedCols(std::int32_t columns) { fixed_columns_ = checked_fixed(columns, Cols()); }

Text Grid::TextMatrix(std::int32_t row, std::int32_t column) const {
  return Text(cell(index_in(rows_, row), index_in(columns_, column)));
}

void Grid::put_TextMatrix(std::int32_t row, std::int32_t column, const Text& value) {
  fill(rows_[index_in(rows_, row)], index_in(columns_, column), value);
}

Variant Grid::Cell(std::int16_t setting, std::int32_t row, std::int32_t column) const {
  Text text = TextMatrix(row, column);
  if (setting == text_setting) return text;
  if (setting != check_box_setting) raise(ErrorNumber::invalid_procedure_call);
  if (at(column).data_type != boolean_type) return no_check_box;
  return is_true(text) ? ticked : not_ticked;
}

void Grid::put_Cell(std::int16_t setting, std::int32_t row, std::int32_t column, const Variant& value) {
  if (setting == text_setting) return put_TextMatrix(row, column, value.to_text());
  if (setting != check_box_setting) raise(ErrorNumber::invalid_procedure_call);
  const std::int16_t state = value.to_int16();
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
  for (TableRow& row : rows_) row.cells.clear();
}

void Grid::AddItem(const Text& item, std::int32_t index) {
  if (index < -1 || index > Rows()) raise(ErrorNumber::subscript_out_of_range);
  if (Rows() == most_rows) raise(ErrorNumber::out_of_memory);
  TableRow row;
  const TextView cells = item;
  std::size_t start = 0;
  for (std::size_t column = 0; column < columns_.size() && start <= cells.size(); ++column) {
    const std::size_t end = std::min(cells.find(u'\t', start), cells.size());
    fill(row, column, cells.substr(start, end - start));
    start = end + 1;
  }
  rows_.insert(index == -1 ? rows_.end() : rows_.begin() + index, std::move(row));
}

void Grid::RemoveItem(std::int32_t index) {
  rows_.erase(rows_.begin() + static_cast<std::ptrdiff_t>(index_in(rows_, index)));
  fixed_rows_ = std::min(fixed_rows_, Rows());
  keep_selection_inside();
}

void Grid::SaveGrid(const Text& file, std::int16_t format_code, Boolean fixed_cells) const {
  const Format format = format_of(format_code);
  const auto first_row = static_cast<std::size_t>(fixed_cells ? 0 : fixed_rows_);
  const auto first_column = static_cast<std::size_t>(fixed_cells ? 0 : fixed_columns_);
  std::vector<std::size_t> widths(columns_.size());
  bool is_wide = false;
  for (std::size_t r = first_row; r < rows_.size(); ++r) {
    for (std::size_t c = first_column; c < rows_[r].cells.size(); ++c) {
      const TextView text = cell(r, c);
      is_wide = is_wide || !TableFile::fits_code_page(text);
      widths[c] = std::max(widths[c], text.size());
    }
  }

  TableFile output(files_, file, is_wide);
  Text line;
  for (std::size_t r = first_row; r < rows_.size(); ++r) {
    line.clear();
    for (std::size_t c = first_column; c < columns_.size(); ++c) {
      const TextView text = cell(r, c);
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
  const Text text = read_table_file(files_, file);
  const auto rows = format == Format::fixed_text ? read_fixed(text) : read_delimited(text, separator_of(format));

  const auto first_row = static_cast<std::size_t>(fixed_cells ? 0 : fixed_rows_);
  const auto first_column = static_cast<std::size_t>(fixed_cells ? 0 : fixed_columns_);
  std::size_t width = 0;
  for (const auto& row : rows) width = std::max(width, row.size());
  const std::size_t columns = first_column + width;
  if (first_row + rows.size() > most_rows || columns > most_columns) raise(ErrorNumber::out_of_memory);

  put_Cols(static_cast<std::int32_t>(columns));
  put_Rows(static_cast<std::int32_t>(first_row));
  put_Rows(static_cast<std::int32_t>(first_row + rows.size()));
  for (std::size_t r = 0; r < rows.size(); ++r) {
    for (std::size_t c = 0; c < rows[r].size(); ++c) fill(rows_[first_row + r], first_column + c, rows[r][c]);
  }
}

}  // namespace talutil
