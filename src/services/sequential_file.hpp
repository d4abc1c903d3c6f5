#pragma once

#include <memory>
#include <optional>
#include <vector>

#include "platform/platform.hpp"

namespace talutil {

/// Reads a text file in the ANSI code page as the hosts' sequential input does: a line ends at a carriage return, with
/// or without a line feed after it; a lone line feed is an ordinary character. The first character 26 ends the file.
/// The last line counts even without a line end.
class SequentialInput {
 public:
  /// Raises the same errors as Files::open_input.
  SequentialInput(const Platform& platform, const Text& path);

  [[nodiscard]] bool at_end();

  /// Reads the next line, without its line end; raises 62 at the end of the file.
  void read_line(Text& line);

  /// The rest of the file, including line ends.
  [[nodiscard]] Text read_rest();

 private:
  /// Bytes that were read from the file but not consumed yet.
  [[nodiscard]] std::string_view pending() const noexcept { return {buffer_.data() + begin_, end_ - begin_}; }
  void fill();
  [[nodiscard]] bool read_short_line(Text& line);
  void pass(std::size_t length);

  /// Makes a line of its bytes.
  void convert(std::string_view bytes, Text& line);
  void break_off(Text& text);
  [[nodiscard]] bool append_ascii(Text& text);

  CodePage& code_page_;
  std::unique_ptr<InputFile> file_;
  std::vector<char> buffer_;
  std::string carried_;  ///< The beginning of a line that goes on in the next buffer.
  std::size_t begin_ = 0;
  std::size_t end_ = 0;
  bool is_over_ = false;
};

/// Writes a text file in the ANSI code page. Nothing changes on disk until `close` puts the file in place.
class SequentialOutput {
 public:
  /// Raises the same errors as Files::open_output.
  SequentialOutput(const Platform& platform, const Text& path)
      : code_page_(platform.code_page), file_(platform.files.open_output(path)) {}

  /// Writes a line and its line end (carriage return, line feed).
  void write_line(TextView line);
  void close();

 private:
  CodePage& code_page_;
  std::unique_ptr<OutputFile> file_;
  std::string buffer_;
};

/// A line as stored in a file: in the code page, with its line end.
[[nodiscard]] std::string file_line(CodePage& code_page, TextView line);

}  // namespace talutil
