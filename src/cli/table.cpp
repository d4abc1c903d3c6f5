#include "cli/table.hpp"

#include <algorithm>

#include "cli/failure.hpp"
#include "controls/delimited_text.hpp"

namespace talutil::cli {

namespace {

std::size_t column_count(const TableRows& rows) {
  std::size_t columns = 0;
  for (const auto& row : rows) columns = std::max(columns, row.size());
  return columns;
}

}  // namespace

void require_text(TextView text, const std::string& path) {
  constexpr std::size_t looked_at = 4096;
  const TextView beginning = text.substr(0, looked_at);
  const auto is_strange = [](char16_t unit) {
    return unit < u' ' && TextView(u"\t\n\r\f").find(unit) == TextView::npos;
  };
  const auto strange = static_cast<std::size_t>(std::ranges::count_if(beginning, is_strange));
  // A text can have a stray control character; one in twenty is a program or a picture.
  if (strange * 20 <= beginning.size()) return;
  throw run_time_failure(shown_input(path) + ": is no text: " + std::to_string(strange) + " of its first " +
                         std::to_string(beginning.size()) + " characters are control characters");
}

TableRows read_table(const std::string& path, const InputEncoding& encoding) {
  const Text text = read_text(path, encoding);
  require_text(text, path);
  TableRows rows = read_delimited(text, u',');
  const auto require = [&](std::size_t count, std::int32_t most, const char* what) {
    if (count <= static_cast<std::size_t>(most)) return;
    throw run_time_failure(shown_input(path) + ": has " + std::to_string(count) + " " + what +
                           "; a table has at most " + std::to_string(most));
  };
  require(rows.size(), Grid::most_rows, "rows");
  require(column_count(rows), Grid::most_columns, "columns");
  return rows;
}

void fill_grid(Grid& grid, const TableRows& rows) {
  grid.put_Cols(static_cast<std::int32_t>(column_count(rows)));
  grid.put_Rows(static_cast<std::int32_t>(rows.size()));
  for (std::size_t r = 0; r < rows.size(); ++r) {
    for (std::size_t c = 0; c < rows[r].size(); ++c) {
      grid.put_cell(static_cast<std::int32_t>(r), static_cast<std::int32_t>(c), rows[r][c]);
    }
  }
}

}  // namespace talutil::cli
