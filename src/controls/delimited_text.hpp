#pragma once

#include <functional>
#include <memory>
#include <span>
#include <vector>

#include "platform/files.hpp"

/// Tables as text: a row is a line that ends with carriage return and line feed.
namespace talutil {

/// Writes a file in code page 1252, or in UTF-8 with a byte-order mark where the file is to hold a character that has
/// no place in the code page. It takes its name with `close`.
class TableFile {
 public:
  /// @param is_wide whether a text of the file fails `fits_code_page`
  /// Raises what opening raises.
  TableFile(Files& files, const Text& path, bool is_wide);

  void write(TextView text);
  void close();

  [[nodiscard]] static bool fits_code_page(TextView text) noexcept;

 private:
  void flush();

  std::unique_ptr<OutputFile> file_;
  std::string bytes_;
  bool is_wide_;
};

/// The text of such a file. Raises what opening and reading raise.
[[nodiscard]] Text read_table_file(Files& files, const Text& path);

/// A cell between separators: in quotes, with its quotes doubled, when it has a separator, a quote or a line break in
/// it.
void append_delimited(Text& line, TextView cell, char16_t separator);

/// The rows of a text with separators; any line end ends a row. A quoted cell goes to its closing quote, what follows
/// up to the separator is part of it; a quote that is never closed takes the rest of the text.
[[nodiscard]] std::vector<std::vector<Text>> read_delimited(TextView text, char16_t separator);

/// The rows of a text in columns of fixed widths: a column begins where every line has two blanks before it, or has
/// ended. Blanks at the end of a cell are not part of it.
[[nodiscard]] std::vector<std::vector<Text>> read_fixed(TextView text);

}  // namespace talutil
