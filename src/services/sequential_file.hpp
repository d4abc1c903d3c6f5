#pragma once

#include <memory>
#include <optional>
#include <vector>

#include "platform/files.hpp"

namespace talutil {

/// A text file read from its beginning, in ANSI, as the hosts' sequential input reads it: a line ends at a carriage
/// return, with or without a line feed after it; a lone line feed is a character like others. The first character
/// 26 ends the file. Nothing is lost at the end: the last line counts also without a line end.
class SequentialInput {
 public:
  /// Raises what opening raises.
  SequentialInput(Files& files, const Text& path);

  [[nodiscard]] bool at_end();

  /// The next line, without its end; raises 62 at the end of the file.
  void read_line(Text& line);

  /// All that is left, line ends included.
  [[nodiscard]] Text read_rest();

 private:
  /// What is read but not yet taken.
  [[nodiscard]] std::string_view pending() const noexcept { return {buffer_.data() + begin_, end_ - begin_}; }
  void fill();

  std::unique_ptr<InputFile> file_;
  std::vector<char> buffer_;
  std::size_t begin_ = 0;
  std::size_t end_ = 0;
  bool is_over_ = false;
};

/// A text file written in ANSI. It takes its name with `close`; before that nothing has changed.
class SequentialOutput {
 public:
  /// Raises what opening raises.
  SequentialOutput(Files& files, const Text& path) : file_(files.open_output(path)) {}

  /// Writes a line with its end (carriage return, line feed).
  void write_line(TextView line);
  void close();

 private:
  std::unique_ptr<OutputFile> file_;
  std::string buffer_;
};

/// A line as it stands in a file: in ANSI, with its end.
[[nodiscard]] std::string file_line(TextView line);

}  // namespace talutil
