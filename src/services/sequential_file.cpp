#include "services/sequential_file.hpp"

#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

constexpr std::size_t buffer_size = 1U << 18U;
constexpr char end_of_file_mark = 26;

}  // namespace

SequentialInput::SequentialInput(Files& files, const Text& path) : file_(files.open_input(path)), buffer_(buffer_size) {
  fill();
}

void SequentialInput::fill() {
  begin_ = end_ = 0;
  if (is_over_) return;
  end_ = file_->read(buffer_);
  const std::size_t mark = pending().find(end_of_file_mark);
  is_over_ = end_ == 0 || mark != std::string_view::npos;
  if (mark != std::string_view::npos) end_ = mark;
}

bool SequentialInput::at_end() {
  if (begin_ == end_) fill();
  return begin_ == end_;
}

void SequentialInput::read_line(Text& line) {
  if (at_end()) raise(ErrorNumber::input_past_end_of_file);
  line.clear();
  while (!at_end()) {
    const std::size_t length = pending().find('\r');
    append_ansi(line, pending().substr(0, length));
    if (length == std::string_view::npos) {
      begin_ = end_;
      continue;
    }
    begin_ += length + 1;
    // The line feed may be the first byte of the next buffer.
    if (!at_end() && pending().front() == '\n') ++begin_;
    return;
  }
}

Text SequentialInput::read_rest() {
  Text text;
  text.reserve(static_cast<std::size_t>(file_->size()));
  while (!at_end()) {
    append_ansi(text, pending());
    begin_ = end_;
  }
  return text;
}

void SequentialOutput::write_line(TextView line) {
  buffer_ += file_line(line);
  if (buffer_.size() < buffer_size) return;
  file_->write(buffer_);
  buffer_.clear();
}

void SequentialOutput::close() {
  file_->write(buffer_);
  file_->close();
}

std::string file_line(TextView line) { return to_ansi(line) + "\r\n"; }

}  // namespace talutil
