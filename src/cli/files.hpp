#pragma once

#include <memory>
#include <span>
#include <string>
#include <string_view>

#include "automation/text.hpp"
#include "platform/files.hpp"

/// Inputs and outputs of the command. "-" is standard input or output. Failures name the file and the reason.
namespace talutil::cli {

/// How a path is shown in messages.
[[nodiscard]] std::string shown_input(const std::string& path);
[[nodiscard]] std::string shown_output(const std::string& path);

/// An input that is read piece by piece.
class Input {
 public:
  explicit Input(const std::string& path);
  Input(const Input&) = delete;
  Input& operator=(const Input&) = delete;
  ~Input();

  /// Waits until some bytes are there; returns 0 at the end.
  std::size_t read(std::span<char> buffer);

  /// 0 if it cannot be known, as for a pipe.
  [[nodiscard]] std::uint64_t size() const noexcept { return size_; }
  [[nodiscard]] std::uint64_t done() const noexcept { return done_; }

 private:
  std::string path_;
  int file_;
  std::uint64_t size_ = 0;
  std::uint64_t done_ = 0;
};

/// An output. A regular file gets its name, in place of an older one, when it is closed; what is no regular file is
/// written as it comes.
class Output {
 public:
  explicit Output(std::string path);

  void write(std::string_view bytes);
  void close();

 private:
  void flush();

  std::string path_;
  std::unique_ptr<OutputFile> file_;
  std::string bytes_;
};

/// All bytes of an input.
[[nodiscard]] std::string read_bytes(const std::string& path);

/// Writes an output as a whole.
void write_bytes(const std::string& path, std::string_view bytes);

/// The path that the library's own writers take for an output: "-" is the process's standard output there.
[[nodiscard]] Text output_path(const std::string& path);

/// Converts UTF-8 to a text; anything else fails with `what`, the name of its source.
[[nodiscard]] Text utf8_text(std::string_view bytes, const std::string& what);

}  // namespace talutil::cli
