#include "cli/files.hpp"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstring>
#include <iostream>

#include "cli/failure.hpp"
#include "platform/posix/posix_files.hpp"

namespace talutil::cli {

std::string shown_input(const std::string& path) { return path == "-" ? "standard input" : path; }
std::string shown_output(const std::string& path) { return path == "-" ? "standard output" : path; }

Input::Input(const std::string& path)
    : path_(shown_input(path)), file_(path == "-" ? STDIN_FILENO : open(path.c_str(), O_RDONLY | O_CLOEXEC)) {
  struct stat status {};
  const bool is_open = file_ >= 0 && fstat(file_, &status) == 0;
  if (is_open && S_ISDIR(status.st_mode)) errno = EISDIR;
  if (!is_open || S_ISDIR(status.st_mode)) {
    throw run_time_failure("cannot read \"" + path_ + "\": " + std::strerror(errno));
  }
  if (S_ISREG(status.st_mode)) size_ = static_cast<std::uint64_t>(status.st_size);
}

Input::~Input() {
  if (file_ > STDERR_FILENO) close(file_);
}

std::size_t Input::read(std::span<char> buffer) {
  for (;;) {
    const ssize_t count = ::read(file_, buffer.data(), buffer.size());
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) throw run_time_failure("cannot read \"" + path_ + "\": " + std::strerror(errno));
    done_ += static_cast<std::uint64_t>(count);
    return static_cast<std::size_t>(count);
  }
}

Output::Output(std::string path) : path_(std::move(path)) {
  on_file("cannot write \"" + shown_output(path_) + "\"", [&] {
    // What was printed before stays before.
    if (path_ == "-") std::cout.flush();
    posix::PosixFiles files;
    files.allow_streams();
    file_ = files.open_output(output_path(path_));
  });
}

void Output::write(std::string_view bytes) {
  constexpr std::size_t enough = 1U << 18U;
  bytes_ += bytes;
  if (bytes_.size() >= enough) flush();
}

void Output::close() {
  flush();
  on_file("cannot write \"" + shown_output(path_) + "\"", [&] { file_->close(); });
}

void Output::flush() {
  on_file("cannot write \"" + shown_output(path_) + "\"", [&] { file_->write(bytes_); });
  bytes_.clear();
}

std::string read_bytes(const std::string& path) {
  Input input(path);
  std::string bytes;
  std::array<char, 1U << 16U> buffer;
  while (const std::size_t count = input.read(buffer)) bytes.append(buffer.data(), count);
  return bytes;
}

void write_bytes(const std::string& path, std::string_view bytes) {
  Output output(path);
  output.write(bytes);
  output.close();
}

Text output_path(const std::string& path) { return utf8_text(path == "-" ? "/dev/stdout" : path, "the file's name"); }

Text utf8_text(std::string_view bytes, const std::string& what) {
  Text text = from_utf8(bytes);
  if (to_utf8(text) != bytes) throw usage_failure(what + " is not in UTF-8; convert it first, for example with iconv");
  return text;
}

}  // namespace talutil::cli
