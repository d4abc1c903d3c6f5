#include "controls/delimited_text.hpp"

#include <algorithm>
#include <array>
#include <bit>
#include <cstring>

#include "automation/run_time_error.hpp"

namespace talutil {

namespace {

constexpr std::string_view byte_order_mark = "\xEF\xBB\xBF";

/// Whether a cell needs quotes. Blocks of eight, of which the last may overlap the one before.
bool is_special(TextView cell, char16_t separator) noexcept {
  using Units [[gnu::vector_size(16)]] = char16_t;
  constexpr std::size_t step = sizeof(Units) / sizeof(char16_t);
  const auto is_special_unit = [separator](auto unit) {
    return (unit == separator) | (unit == u'"') | (unit == u'\r') | (unit == u'\n');
  };
  if (cell.size() < step) return std::ranges::any_of(cell, is_special_unit);
  decltype(is_special_unit(Units{})) special{};
  const auto look_at = [&](std::size_t at) {
    Units units;
    std::memcpy(&units, cell.data() + at, sizeof units);
    special |= is_special_unit(units);
  };
  for (std::size_t at = 0; at + step < cell.size(); at += step) look_at(at);
  look_at(cell.size() - step);
  const auto halves = std::bit_cast<std::array<std::uint64_t, 2>>(special);
  return (halves[0] | halves[1]) != 0;
}

/// The position after a line end.
std::size_t after_line_end(TextView text, std::size_t at) noexcept {
  return text.substr(at).starts_with(u"\r\n") ? at + 2 : at + 1;
}

std::vector<TextView> lines_of(TextView text) {
  std::vector<TextView> lines;
  for (std::size_t at = 0; at < text.size();) {
    const std::size_t end = std::min(text.find_first_of(u"\r\n", at), text.size());
    lines.push_back(text.substr(at, end - at));
    at = end == text.size() ? end : after_line_end(text, end);
  }
  return lines;
}

/// Reads the cell at a position and moves the position past it.
Text delimited_cell(TextView text, std::size_t& at, char16_t separator) {
  Text cell;
  if (at < text.size() && text[at] == u'"') {
    for (++at; at < text.size(); ++at) {
      if (text[at] == u'"') {
        ++at;
        if (at == text.size() || text[at] != u'"') break;
      }
      cell += text[at];
    }
  }
  const char16_t ends[] = {separator, u'\r', u'\n'};
  const std::size_t end = std::min(text.find_first_of(TextView(ends, std::size(ends)), at), text.size());
  cell += text.substr(at, end - at);
  at = end;
  return cell;
}

}  // namespace

TableFile::TableFile(Files& files, CodePage& code_page, const Text& path, bool is_wide)
    : code_page_(code_page),
      file_(files.open_output(path)),
      bytes_(is_wide ? byte_order_mark : std::string_view()),
      is_wide_(is_wide) {}

void TableFile::write(TextView text) {
  constexpr std::size_t enough = 65536;
  bytes_ += is_wide_ ? to_utf8(text) : code_page_.bytes_of(text);
  if (bytes_.size() >= enough) flush();
}

void TableFile::close() {
  flush();
  file_->close();
}

void TableFile::flush() {
  file_->write(bytes_);
  bytes_.clear();
}

Text read_table_file(Files& files, CodePage& code_page, const Text& path) {
  const auto file = files.open_input(path);
  constexpr std::uint64_t largest = 1U << 30;  // A larger table would not fit into a 32-bit process.
  if (file->size() > largest) raise(ErrorNumber::out_of_memory);
  std::string bytes(static_cast<std::size_t>(file->size()), '\0');
  std::size_t size = 0;
  while (size < bytes.size()) {
    const std::size_t read = file->read(std::span(bytes).subspan(size));
    if (read == 0) break;
    size += read;
  }
  const std::string_view content = std::string_view(bytes).substr(0, size);
  return content.starts_with(byte_order_mark) ? from_utf8(content.substr(byte_order_mark.size()))
                                              : code_page.text_of(content);
}

void append_delimited(Text& line, TextView cell, char16_t separator) {
  if (!is_special(cell, separator)) {
    line += cell;
    return;
  }
  line += u'"';
  for (std::size_t at = 0; at < cell.size();) {
    const std::size_t quote = find_unit(cell, u'"', at);
    line += cell.substr(at, quote - at);
    if (quote < cell.size()) line += u"\"\"";
    at = quote + 1;
  }
  line += u'"';
}

void each_delimited_row(TextView text, char16_t separator, const std::function<void(std::vector<Text>& row)>& use) {
  std::vector<Text> row;
  for (std::size_t at = 0; at < text.size();) {
    row.clear();
    row.push_back(delimited_cell(text, at, separator));
    while (at < text.size() && text[at] == separator) row.push_back(delimited_cell(text, ++at, separator));
    if (at < text.size()) at = after_line_end(text, at);
    use(row);
  }
}

std::vector<std::vector<Text>> read_delimited(TextView text, char16_t separator) {
  std::vector<std::vector<Text>> rows;
  each_delimited_row(text, separator, [&](std::vector<Text>& row) { rows.push_back(std::move(row)); });
  return rows;
}

std::vector<std::vector<Text>> read_fixed(TextView text) {
  const std::vector<TextView> lines = lines_of(text);
  // The columns in which any line has a character.
  std::vector<bool> is_taken;
  for (const TextView line : lines) {
    is_taken.resize(std::max(is_taken.size(), line.size()));
    for (std::size_t i = 0; i < line.size(); ++i) is_taken[i] = is_taken[i] || line[i] != u' ';
  }
  std::vector<std::size_t> starts{0};
  for (std::size_t i = 2; i < is_taken.size(); ++i) {
    if (is_taken[i] && !is_taken[i - 1] && !is_taken[i - 2]) starts.push_back(i);
  }

  std::vector<std::vector<Text>> rows;
  for (const TextView line : lines) {
    std::vector<Text>& row = rows.emplace_back();
    for (std::size_t column = 0; column < starts.size() && starts[column] <= line.size(); ++column) {
      const std::size_t end = column + 1 < starts.size() ? starts[column + 1] : Text::npos;
      const TextView cell = line.substr(starts[column], end == Text::npos ? end : end - starts[column]);
      row.emplace_back(cell.substr(0, cell.find_last_not_of(u' ') + 1));
    }
  }
  return rows;
}

}  // namespace talutil
