#include "cli/json_lines.hpp"

#include <algorithm>
#include <utility>

#include "calling/json_reader.hpp"
#include "cli/failure.hpp"

namespace talutil::cli {

using calling::JsonReader;

namespace {

/// A value as text; null is empty.
Text read_cell(JsonReader& json) {
  Text text;
  switch (json.kind()) {
    case JsonReader::Kind::text:
      json.read_text(text);
      return text;
    case JsonReader::Kind::number:
      return from_utf8(json.read_number());
    case JsonReader::Kind::truth:
      return json.read_truth() ? u"True" : u"False";
    case JsonReader::Kind::null:
      json.read_null();
      return text;
    case JsonReader::Kind::object:
    case JsonReader::Kind::array:
      break;
  }
  json.fail("a text, a number, true, false or null");
}

/// Calls a function with each name and value of an object.
template <class Use>
void each_cell(TextView line, Use use) {
  const std::string bytes = to_utf8(line);
  try {
    JsonReader json(bytes);
    Text name;
    json.begin_object();
    while (json.next_key(name)) use(name, read_cell(json));
    json.end();
  } catch (const calling::JsonError& error) {
    throw run_time_failure(error.what() +
                           std::string("; write one object with texts and numbers per line: {\"Name\": \"Anne\"}"));
  }
}

}  // namespace

/// Finds the next line that is not empty.
bool JsonLinesReader::find_line() {
  for (;;) {
    const Text& text = pieces_.text();
    const std::size_t end = text.find(u'\n', next_);
    if (end == Text::npos && !pieces_.has_ended()) {
      if (pieces_.fetch(next_, line_ + 1)) next_ = 0;
      continue;
    }
    if (next_ == text.size()) return false;
    row_start_ = next_;
    row_length_ = std::min(end, text.size()) - next_;
    if (row_length_ > 0 && text[row_start_ + row_length_ - 1] == u'\r') --row_length_;
    next_ = std::min(end, text.size() - 1) + 1;
    ++line_;
    if (row_length_ > 0) return true;
  }
}

bool JsonLinesReader::read(std::vector<Text>& row) {
  if (columns_.empty()) {
    if (!find_line()) return false;
    row.clear();
    within("line " + std::to_string(line_), [&] {
      each_cell(raw(), [&](const Text& name, const Text&) {
        if (!columns_.emplace(name, row.size()).second) throw run_time_failure("has \"" + to_utf8(name) + "\" twice");
        row.push_back(name);
      });
      if (row.empty()) throw run_time_failure("has no columns");
    });
    has_first_ = true;
    return true;
  }
  if (!std::exchange(has_first_, false) && !find_line()) return false;
  row.assign(columns_.size(), Text());
  within("line " + std::to_string(line_), [&] {
    each_cell(raw(), [&](const Text& name, Text&& value) {
      const auto column = columns_.find(name);
      if (column == columns_.end())
        throw run_time_failure("has \"" + to_utf8(name) + "\", which the first line has not");
      row[column->second] = std::move(value);
    });
  });
  return true;
}

}  // namespace talutil::cli
