#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace talutil::cli {

/// Reads comma-separated values row by row: a field may be in double quotes and then contain commas, line breaks and
/// doubled quotes. Rows end with a line feed, with or without a carriage return. Any byte is data, even NUL. Does not
/// copy: the bytes must outlive the reader.
class CsvReader {
 public:
  explicit CsvReader(std::string_view bytes) noexcept : bytes_(bytes) {}

  /// Reads the next row; returns false at the end. Fails with the line number for an unclosed quote and for text after
  /// a closing quote.
  bool read(std::vector<std::string>& row);

  /// The line of the file, from 1, on which the most recently read row begins.
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
