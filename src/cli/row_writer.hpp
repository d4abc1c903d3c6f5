#pragma once

#include <memory>
#include <string>
#include <vector>

#include "automation/text.hpp"
#include "cli/encoding.hpp"

namespace talutil::cli {

/// How cleaned rows are written.
struct RowFormat {
  std::string name = "sql";     ///< "sql", "csv" or "jsonl".
  std::string table;            ///< For SQL.
  std::vector<bool> is_number;  ///< Columns whose values are written without quotes, if they are numbers.
  bool empty_is_null = false;   ///< SQL NULL, JSON null.
  bool in_transaction = false;  ///< For SQL.
  TextView line_end = u"\r\n";
};

/// Formats rows as SQL inserts, CSV or JSON lines.
class RowWriter {
 public:
  virtual ~RowWriter() = default;

  virtual void begin(Text& text) = 0;
  virtual void add(Text& text, const std::vector<Text>& row) = 0;
  virtual void end(Text& text) = 0;
};

/// An unknown format is a usage error.
[[nodiscard]] std::unique_ptr<RowWriter> make_row_writer(const RowFormat& format, const std::vector<Text>& columns);

}  // namespace talutil::cli
