#pragma once

#include <string>
#include <unordered_map>

#include "cli/row_reader.hpp"

namespace talutil::cli {

/// Reads JSON lines: one object per line, whose values are texts, numbers, True, False or null (an empty text). The
/// names in the first object are the columns; a later object may leave some out. Empty lines are passed over.
class JsonLinesReader final : public RowReader {
 public:
  explicit JsonLinesReader(TextSource source) : pieces_(std::move(source)) {}

  bool read(std::vector<Text>& row) override;
  [[nodiscard]] std::size_t line() const noexcept override { return line_; }
  [[nodiscard]] TextView raw() const noexcept override {
    return TextView(pieces_.text()).substr(row_start_, row_length_);
  }

 private:
  bool find_line();

  PieceBuffer pieces_;
  std::size_t next_ = 0;
  std::size_t row_start_ = 0;
  std::size_t row_length_ = 0;
  std::size_t line_ = 0;
  std::unordered_map<Text, std::size_t> columns_;
  bool has_first_ = false;  ///< The first object has been taken for the columns, but is yet to be read as a row.
};

}  // namespace talutil::cli
