#include "services/sequential_file.hpp"

#include <algorithm>
#include <array>
#include <bit>
#include <cstring>
#include <span>

#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

// Small enough to stay in the processor's cache, also as text.
constexpr std::size_t buffer_size = 1U << 16U;
constexpr char end_of_file_mark = 26;
constexpr char line_end = '\r';

/// Writes a unit for each byte before the first line end and returns their number. Returns nothing if a byte before it
/// is not ASCII, or if there is no line end in the room for units. (Not inline: the compiler, which would then know how
/// short a line is, would copy it by an instruction that takes long to begin.)
[[gnu::noinline]] std::optional<std::size_t> widen_line(std::string_view bytes, std::span<char16_t> units) noexcept {
  using Bytes [[gnu::vector_size(8)]] = std::uint8_t;
  using Units [[gnu::vector_size(16)]] = char16_t;
  static_assert(std::endian::native == std::endian::little);
  constexpr std::size_t step = sizeof(Bytes);
  constexpr std::uint64_t not_ascii = 0x8080808080808080;
  const std::size_t room = std::min(bytes.size(), units.size());
  std::size_t at = 0;
  for (; at + step <= room; at += step) {
    Bytes block;
    std::memcpy(&block, bytes.data() + at, step);
    const Units wide = __builtin_convertvector(block, Units);
    std::memcpy(units.data() + at, &wide, sizeof wide);
    const auto ends = std::bit_cast<std::uint64_t>(static_cast<Bytes>(block == line_end));
    const std::uint64_t special = ends | (std::bit_cast<std::uint64_t>(block) & not_ascii);
    if (special == 0) continue;
    at += static_cast<std::size_t>(std::countr_zero(special)) / 8;
    return bytes[at] == line_end ? std::optional(at) : std::nullopt;
  }
  for (; at < room; ++at) {
    const auto byte = static_cast<std::uint8_t>(bytes[at]);
    if (byte == line_end) return at;
    if (byte >= 0x80) return std::nullopt;
    units[at] = byte;
  }
  return std::nullopt;
}

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
  if (read_short_line(line)) return;
  while (!at_end()) {
    const std::size_t length = pending().find(line_end);
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
    pass(length);
    return;
  }
  convert(carried_, line);
  carried_.clear();
}

/// Reads the next line if it is ASCII, as most are, and not long: its end is found while it is converted.
bool SequentialInput::read_short_line(Text& line) {
  constexpr std::size_t short_length = 1024;
  std::array<char16_t, short_length> units;  // NOLINT(cppcoreguidelines-pro-type-member-init): filled first.
  const auto length = widen_line(pending(), units);
  if (!length) return false;
  line.assign(units.data(), *length);
  pass(*length);
  return true;
}

/// Passes over a line and its end, of which the line feed may be the first byte of the next buffer.
void SequentialInput::pass(std::size_t length) {
  begin_ += length + 1;
  if (!at_end() && pending().front() == '\n') ++begin_;
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
