#include "cli/csv.hpp"

#include <algorithm>

#include "cli/failure.hpp"

namespace talutil::cli {

bool CsvReader::fetch() {
  if (!pieces_.fetch(start_, line_)) return false;
  start_ = 0;
  return true;
}

bool CsvReader::read(std::vector<Text>& row) {
  for (;;) {
    if (start_ == pieces_.text().size()) {
      if (!fetch()) return false;
      continue;
    }
    row_line_ = line_;
    if (parse(row) == Outcome::incomplete) {
      fetch();
    } else if (row_length_ > 0) {
      return true;
    }
  }
}

/// The length of the line end at a position: 0 if there is none, 1 or 2.
std::size_t CsvReader::line_end_at(std::size_t at) const noexcept {
  const Text& text = pieces_.text();
  if (text[at] == u'\n') return 1;
  if (text[at] != u'\r') return 0;
  if (at + 1 == text.size()) return pieces_.has_ended() ? 1 : 0;
  return text[at + 1] == u'\n' ? 2 : 0;
}

std::size_t CsvReader::lines_between(std::size_t begin, std::size_t end) const {
  return static_cast<std::size_t>(std::ranges::count(TextView(pieces_.text()).substr(begin, end - begin), u'\n'));
}

void CsvReader::finish_row(std::size_t end, std::size_t next) {
  row_start_ = start_;
  row_length_ = end - start_;
  // Only in quotes can there be line feeds before the end.
  line_ += has_quotes_ ? lines_between(start_, next) : lines_between(end, next);
  start_ = next;
}

/// Ends a row that cannot be read at the first line end from a position on.
void CsvReader::pass_over(std::size_t from) {
  const Text& text = pieces_.text();
  const std::size_t end = std::min(text.find(u'\n', from), text.size());
  const bool has_return = end > start_ && text[end - 1] == u'\r';
  finish_row(has_return ? end - 1 : end, std::min(end + 1, text.size()));
}

/// The end of a field without quotes.
std::size_t CsvReader::unquoted_end(std::size_t at) const noexcept {
  const TextView text = pieces_.text();
  for (; at < text.size(); ++at) {
    const char16_t unit = text[at];
    if (unit == u',' || unit == u'\n' || (unit == u'\r' && line_end_at(at) != 0)) break;
  }
  return at;
}

/// Reads the row at `start_`, which is incomplete if the text ends before it and more can follow.
CsvReader::Outcome CsvReader::parse(std::vector<Text>& row) {
  const Text& text = pieces_.text();
  std::size_t count = 0;
  has_quotes_ = false;
  for (std::size_t at = start_;; ++at) {
    if (count == row.size()) row.emplace_back();
    Text& field = row[count++];
    if (at < text.size() && text[at] == u'"') {
      if (quoted_field(field, at) == Outcome::incomplete) return Outcome::incomplete;
    } else {
      const std::size_t begin = at;
      at = unquoted_end(at);
      field.assign(text, begin, at - begin);
    }
    if (at == text.size() && !pieces_.has_ended()) return Outcome::incomplete;
    if (at < text.size() && text[at] == u',') continue;
    row.resize(count);
    finish_row(at, at == text.size() ? at : at + line_end_at(at));
    return Outcome::row;
  }
}

CsvReader::Outcome CsvReader::quoted_field(Text& field, std::size_t& at) {
  const Text& text = pieces_.text();
  const bool may_continue = !pieces_.has_ended();
  field.clear();
  has_quotes_ = true;
  for (;;) {
    const std::size_t begin = at + 1;
    const std::size_t quote = find_unit(text, u'"', begin);
    if (quote == text.size()) {
      if (may_continue) return Outcome::incomplete;
      pass_over(start_);
      throw run_time_failure("line " + std::to_string(row_line_) +
                             ": a quote is never closed; double the quotes inside a field and close it with one");
    }
    field.append(text, begin, quote - begin);
    at = quote + 1;
    if (at == text.size() || text[at] != u'"') break;
    field += u'"';
  }
  // Of a carriage return at the end of a piece, nobody knows yet whether it ends the line.
  if (at + 1 >= text.size() && may_continue) return Outcome::incomplete;
  if (at == text.size() || text[at] == u',' || line_end_at(at) != 0) return Outcome::row;
  if (text.find(u'\n', at) == Text::npos && may_continue) return Outcome::incomplete;
  const std::size_t line = row_line_ + lines_between(start_, at);
  pass_over(at);
  throw run_time_failure("line " + std::to_string(line) +
                         ": text after a closing quote; double the quotes inside a field");
}

}  // namespace talutil::cli
