#include "cli/wrapping.hpp"

#include <stdlib.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>

namespace talutil::cli {

namespace {

/// The columns of a text in UTF-8: bytes that continue a character take none.
std::size_t columns_of(std::string_view text) {
  return static_cast<std::size_t>(std::ranges::count_if(text, [](char c) { return (c & 0xC0) != 0x80; }));
}

/// Takes the part before a separator off the front of a text.
std::string_view take_part(std::string_view& text, std::string_view separator) {
  const auto end = text.find(separator);
  const std::string_view part = text.substr(0, end);
  text = end == std::string_view::npos ? std::string_view() : text.substr(end + separator.size());
  return part;
}

void wrap_paragraph(std::string& out, std::string_view words, std::size_t width, std::size_t indent,
                    std::string_view first) {
  std::string line(first);
  bool is_empty = true;
  while (!words.empty()) {
    const std::string_view word = take_part(words, " ");
    if (!is_empty && columns_of(line) + 1 + columns_of(word) > width) {
      out += line + '\n';
      line.assign(indent, ' ');
      is_empty = true;
    }
    if (!is_empty) line += ' ';
    line += word;
    is_empty = false;
  }
  out += line + '\n';
}

}  // namespace

std::size_t output_width() {
  constexpr std::size_t usual = 80;
  constexpr std::size_t narrowest = 40;
  constexpr std::size_t widest = 100;
  const char* const columns = getenv("COLUMNS");
  const long named = columns == nullptr ? 0 : atol(columns);
  if (named > 0) return std::clamp(static_cast<std::size_t>(named), narrowest, widest);
  winsize size{};
  if (ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) != 0 || size.ws_col == 0) return usual;
  return std::clamp<std::size_t>(size.ws_col, narrowest, widest);
}

std::string wrapped(std::string_view paragraphs, std::size_t width, std::size_t indent, std::string_view first) {
  std::string out;
  std::string begin(first);
  do {
    wrap_paragraph(out, take_part(paragraphs, "\n\n"), width, indent, begin);
    begin.assign(indent, ' ');
    if (!paragraphs.empty()) out += '\n';
  } while (!paragraphs.empty());
  return out;
}

std::string wrapped(std::string_view paragraphs, std::size_t width, std::size_t indent) {
  return wrapped(paragraphs, width, indent, std::string(indent, ' '));
}

std::string indented(std::string_view lines, std::size_t indent) {
  std::string out;
  while (!lines.empty()) {
    const std::string_view line = take_part(lines, "\n");
    if (!line.empty()) out.append(indent, ' ');
    out += line;
    out += '\n';
  }
  return out;
}

}  // namespace talutil::cli
