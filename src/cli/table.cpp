#include "cli/table.hpp"

#include <algorithm>

#include "cli/failure.hpp"
#include "controls/delimited_text.hpp"

namespace talutil::cli {

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

std::size_t read_table(const std::string& path, const InputEncoding& encoding, Grid& grid, const ColumnChoice& choose) {
  const Text text = read_text(path, encoding);
  require_text(text, path);
  std::size_t rows = 0;
  std::size_t columns = 0;
  std::size_t headings = 0;
  std::vector<std::size_t> chosen;
  each_delimited_row(text, u',', [&](const std::vector<Text>& row) {
    columns = std::max(columns, row.size());
    // What is too large is still counted, to say how large it is.
    if (++rows > std::size_t{Grid::most_rows} || columns > std::size_t{Grid::most_columns}) return;
    if (rows == 1 && choose) chosen = choose(row);
    const std::size_t cells = choose ? chosen.size() : row.size();
    if (rows == 1) headings = cells;
    if (cells > static_cast<std::size_t>(grid.Cols())) grid.put_Cols(static_cast<std::int32_t>(cells));
    grid.put_Rows(static_cast<std::int32_t>(rows));
    for (std::size_t c = 0; c < cells; ++c) {
      const std::size_t from = choose ? chosen[c] : c;
      if (from < row.size()) grid.put_cell(grid.Rows() - 1, static_cast<std::int32_t>(c), row[from]);
    }
  });
  const auto require = [&](std::size_t count, std::int32_t most, const char* what) {
    if (count <= static_cast<std::size_t>(most)) return;
    throw run_time_failure(shown_input(path) + ": has " + std::to_string(count) + " " + what +
                           "; a table has at most " + std::to_string(most));
  };
  require(rows, Grid::most_rows, "rows");
  require(columns, Grid::most_columns, "columns");
  return headings;
}

}  // namespace talutil::cli
