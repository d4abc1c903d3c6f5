#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace talutil::cli {

/// Reads comma-separated values row by row: a field may stand in double quotes and then hold commas, line
/// breaks and, doubled, quotes. Rows end with a line feed, with or without a carriage return. Any byte is
/// data, NUL too. Without copying: the bytes must outlive the reader.
class CsvReader {
 public:
  explicit CsvReader(std::string_view bytes) noexcept : bytes_(bytes) {}

  /// The next row; false at the end. Fails with the number of the line for a quote that is never closed and
  /// for text after a closing quote.
  bool read(std::vector<std::string>& row);

  /// The line of the file, from 1, that the row read last begins on.
  [[nodiscard]] std::size_t line() const noexcept { return row_line_; }

 private:
  std::string quoted_field();
  std::string plain_field();
  bool at_end_of_row() const noexcept;

  std::string_view bytes_;
  std::size_t at_ = 0;
  std::size_t line_ = 1;
  std::size_t row_line_ = 0;
};

}  // namespace talutil::cli
