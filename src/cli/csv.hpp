#pragma once

#include "cli/row_reader.hpp"

namespace talutil::cli {

/// Reads comma-separated values row by row: a field may be in double quotes and then contain commas, line breaks and
/// doubled quotes. Rows end with a line feed, with or without a carriage return. Empty lines are passed over. Any other
/// character is data, even NUL. Holds no more of the input than the row being read and a piece after it.
class CsvReader final : public RowReader {
 public:
  explicit CsvReader(TextSource source) : pieces_(std::move(source)) {}

  /// Fails for an unclosed quote and for text after a closing quote.
  bool read(std::vector<Text>& row) override;
  [[nodiscard]] std::size_t line() const noexcept override { return row_line_; }
  [[nodiscard]] TextView raw() const noexcept override {
    return TextView(pieces_.text()).substr(row_start_, row_length_);
  }

 private:
  enum class Outcome : std::uint8_t { row, incomplete };

  bool fetch();
  Outcome parse(std::vector<Text>& row);
  Outcome quoted_field(Text& field, std::size_t& at);
  [[nodiscard]] std::size_t unquoted_end(std::size_t at) const noexcept;
  [[nodiscard]] std::size_t line_end_at(std::size_t at) const noexcept;
  [[nodiscard]] std::size_t lines_between(std::size_t begin, std::size_t end) const;
  void finish_row(std::size_t end, std::size_t next);
  void pass_over(std::size_t from);

  PieceBuffer pieces_;
  std::size_t start_ = 0;  ///< Of the next row.
  std::size_t row_start_ = 0;
  std::size_t row_length_ = 0;
  std::size_t line_ = 1;
  std::size_t row_line_ = 0;
  bool has_quotes_ = false;  ///< The row that is being read.
};

}  // namespace talutil::cli
