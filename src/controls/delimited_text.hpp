#pragma once

#include <functional>
#include <memory>
#include <span>
#include <vector>

#include "platform/code_page.hpp"
#include "platform/files.hpp"

/// Tables as text: each row is a line that ends with carriage return and line feed.
namespace talutil {

/// Writes a file in the ANSI code page, or in UTF-8 with a byte order mark if it is to contain characters that the code
/// page lacks. `close` gives the file its name.
class TableFile {
 public:
  /// @param is_wide true if the code page lacks a character of any text in the file
  ///
  /// Raises the same errors as opening a file.
  TableFile(Files& files, CodePage& code_page, const Text& path, bool is_wide);

  void write(TextView text);
  void close();

 private:
  void flush();

  CodePage& code_page_;
  std::unique_ptr<OutputFile> file_;
  std::string bytes_;
  bool is_wide_;
};

/// The text of such a file. Raises the same errors as opening and reading it.
[[nodiscard]] Text read_table_file(Files& files, CodePage& code_page, const Text& path);

/// Appends a cell. It is quoted, with its quotes doubled, if it contains a separator, a quote or a line break.
void append_delimited(Text& line, TextView cell, char16_t separator);

/// Calls a function with each row of a text with separators; see read_delimited.
void each_delimited_row(TextView text, char16_t separator, const std::function<void(std::vector<Text>& row)>& use);

/// The rows of a text with separators; any line end ends a row. A quoted cell extends to its closing quote; text
/// between that and the separator is part of it. An unclosed quote takes the rest of the text.
[[nodiscard]] std::vector<std::vector<Text>> read_delimited(TextView text, char16_t separator);

/// The rows of a text with columns of fixed width: a column begins where every line has two blanks before it, or has
/// already ended. Trailing blanks are not part of a cell.
[[nodiscard]] std::vector<std::vector<Text>> read_fixed(TextView text);

}  // namespace talutil
