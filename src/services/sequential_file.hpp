#pragma once

#include <memory>
#include <optional>
#include <vector>

#include "platform/files.hpp"

namespace talutil {

/// Reads an ANSI text file as the hosts' sequential input does: a line ends at a carriage return, with or without a
/// line feed after it; a lone line feed is an ordinary character. The first character 26 ends the file. The last line
/// counts even without a line end.
class SequentialInput {
 public:
  /// Raises the same errors as Files::open_input.
  SequentialInput(Files& files, const Text& path);

  [[nodiscard]] bool at_end();

  /// Reads the next line, without its line end; raises 62 at the end of the file.
  void read_line(Text& line);

  /// The rest of the file, including line ends.
  [[nodiscard]] Text read_rest();

 private:
  /// Bytes that were read from the file but not consumed yet.
  [[nodiscard]] std::string_view pending() const noexcept { return {buffer_.data() + begin_, end_ - begin_}; }
  void fill();

  std::unique_ptr<InputFile> file_;
  std::vector<char> buffer_;
  std::size_t begin_ = 0;
  std::size_t end_ = 0;
  bool is_over_ = false;
};

/// Writes an ANSI text file. Nothing changes on disk until `close` puts the file in place.
class SequentialOutput {
 public:
  /// Raises the same errors as Files::open_output.
  SequentialOutput(Files& files, const Text& path) : file_(files.open_output(path)) {}

  /// Writes a line and its line end (carriage return, line feed).
  void write_line(TextView line);
  void close();

 private:
  std::unique_ptr<OutputFile> file_;
  std::string buffer_;
};

/// A line as stored in a file: ANSI, with its line end.
[[nodiscard]] std::string file_line(TextView line);

}  // namespace talutil
