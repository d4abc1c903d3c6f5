#include "cli/csv.hpp"

#include <algorithm>

#include "cli/failure.hpp"

namespace talutil::cli {

bool CsvReader::read(std::vector<std::string>& row) {
  row.clear();
  if (at_ == bytes_.size()) return false;
  row_line_ = line_;
  while (true) {
    const bool is_quoted = at_ < bytes_.size() && bytes_[at_] == '"';
    row.push_back(is_quoted ? quoted_field() : plain_field());
    if (at_end_of_row()) break;
    ++at_;  // the comma
  }
  at_ = std::min(bytes_.find('\n', at_), bytes_.size() - 1) + 1;
  ++line_;
  return true;
}

std::string CsvReader::quoted_field() {
  std::string field;
  const std::size_t first_line = line_;
  while (true) {
    const std::size_t start = at_ + 1;
    const std::size_t quote = bytes_.find('"', start);
    if (quote == std::string_view::npos) {
      throw run_time_failure("line " + std::to_string(first_line) +
                             ": a quote is never closed; double the quotes "
                             "inside a field and close it with one");
    }
    field += bytes_.substr(start, quote - start);
    line_ += static_cast<std::size_t>(std::ranges::count(bytes_.substr(start, quote - start), '\n'));
    at_ = quote + 1;
    if (at_ == bytes_.size() || bytes_[at_] != '"') break;
    field += '"';
  }
  if (!at_end_of_row() && bytes_[at_] != ',') {
    throw run_time_failure("line " + std::to_string(line_) +
                           ": text after a closing quote; double the quotes inside "
                           "a field");
  }
  return field;
}

std::string CsvReader::plain_field() {
  const std::size_t start = at_;
  while (!at_end_of_row() && bytes_[at_] != ',') ++at_;
  return std::string(bytes_.substr(start, at_ - start));
}

bool CsvReader::at_end_of_row() const noexcept {
  const std::string_view rest = bytes_.substr(at_);
  return rest.empty() || rest == "\r" || rest.starts_with('\n') || rest.starts_with("\r\n");
}

}  // namespace talutil::cli
