#include "services/sequential_file.hpp"

#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

// Small enough to stay in the processor's cache, also as text.
constexpr std::size_t buffer_size = 1U << 18U;
constexpr char end_of_file_mark = 26;

}  // namespace

SequentialInput::SequentialInput(const Platform& platform, const Text& path)
    : code_page_(platform.code_page), file_(platform.files.open_input(path)), buffer_(buffer_size) {
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
  while (!at_end()) {
    const std::size_t length = pending().find('\r');
    // Only whole lines are converted, because a character may have several bytes.
    if (length == std::string_view::npos) {
      carried_ += pending();
      begin_ = end_;
      continue;
    }
    if (carried_.empty()) {
      convert(pending().substr(0, length), line);
    } else {
      carried_ += pending().substr(0, length);
      convert(carried_, line);
      carried_.clear();
    }
    begin_ += length + 1;
    // The line feed may be the first byte of the next buffer.
    if (!at_end() && pending().front() == '\n') ++begin_;
    return;
  }
  convert(carried_, line);
  carried_.clear();
}

void SequentialInput::convert(std::string_view bytes, Text& line) {
  line.resize(bytes.size());
  if (widen_ascii(bytes, line.data())) return;
  line.clear();
  code_page_.append_text(line, bytes);
}

/// Converts what was carried over from earlier buffers.
void SequentialInput::break_off(Text& text) {
  code_page_.append_text(text, carried_);
  carried_.clear();
}

/// Appends what is pending if it is ASCII, as most files are.
bool SequentialInput::append_ascii(Text& text) {
  const std::size_t start = text.size();
  text.resize(start + pending().size());
  const bool is_ascii = widen_ascii(pending(), text.data() + start);
  if (is_ascii)
    begin_ = end_;
  else
    text.resize(start);
  return is_ascii;
}

Text SequentialInput::read_rest() {
  Text text;
  text.reserve(static_cast<std::size_t>(file_->size()));
  while (!at_end()) {
    if (carried_.empty() && append_ascii(text)) continue;
    const std::size_t length = pending().rfind('\n') + 1;
    carried_ += pending().substr(0, length);
    if (length > 0) break_off(text);
    carried_ += pending().substr(length);
    begin_ = end_;
  }
  break_off(text);
  return text;
}

void SequentialOutput::write_line(TextView line) {
  buffer_ += file_line(code_page_, line);
  if (buffer_.size() < buffer_size) return;
  file_->write(buffer_);
  buffer_.clear();
}

void SequentialOutput::close() {
  file_->write(buffer_);
  file_->close();
}

std::string file_line(CodePage& code_page, TextView line) { return code_page.bytes_of(line) + "\r\n"; }

}  // namespace talutil
