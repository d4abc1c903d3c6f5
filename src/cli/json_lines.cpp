#include "cli/json_lines.hpp"

#include <algorithm>
#include <utility>

#include "cli/failure.hpp"

namespace talutil::cli {

namespace {

/// Takes an object without objects in it apart.
class FlatObject {
 public:
  explicit FlatObject(TextView text) : rest_(text) {}

  /// Calls a function with each name and value.
  template <class Use>
  void each(Use use) {
    expect(u'{');
    if (peek() == u'}') {
      take();
    } else {
      for (;;) {
        const Text name = string();
        expect(u':');
        use(name, value());
        if (peek() != u',') break;
        take();
      }
      expect(u'}');
    }
    skip_blanks();
    if (!rest_.empty()) fail("has text after the object");
  }

 private:
  [[noreturn]] static void fail(const std::string& what) {
    throw run_time_failure(what + "; write one object with texts and numbers per line: {\"Name\": \"Anne\"}");
  }

  void skip_blanks() { rest_.remove_prefix(std::min(rest_.find_first_not_of(u" \t\r"), rest_.size())); }

  char16_t peek() {
    skip_blanks();
    if (rest_.empty()) fail("ends early");
    return rest_.front();
  }

  char16_t take() {
    if (rest_.empty()) fail("ends early");
    const char16_t unit = rest_.front();
    rest_.remove_prefix(1);
    return unit;
  }

  void expect(char16_t unit) {
    if (peek() != unit) fail("has no \"" + to_utf8(TextView(&unit, 1)) + "\" where one is due");
    take();
  }

  Text string() {
    expect(u'"');
    Text text;
    for (;;) {
      const char16_t unit = take();
      if (unit == u'"') return text;
      if (unit < u' ') fail("has a control character in a text");
      text += unit == u'\\' ? escape() : unit;
    }
  }

  char16_t escape() {
    constexpr TextView letters = u"\"\\/bfnrt";
    constexpr TextView meanings = u"\"\\/\b\f\n\r\t";
    const char16_t letter = take();
    if (const std::size_t place = letters.find(letter); place != TextView::npos) return meanings[place];
    if (letter != u'u') fail("has an escape that JSON does not know");
    unsigned code = 0;
    for (int i = 0; i < 4; ++i) {
      constexpr TextView digits = u"0123456789ABCDEF";
      const std::size_t digit = digits.find(upper_case(take()));
      if (digit == TextView::npos) fail("has an escape that JSON does not know");
      code = code << 4U | static_cast<unsigned>(digit);
    }
    return static_cast<char16_t>(code);
  }

  /// A value as text; null is empty.
  Text value() {
    if (peek() == u'"') return string();
    const TextView word = rest_.substr(0, std::min(rest_.find_first_of(u",} \t\r"), rest_.size()));
    rest_.remove_prefix(word.size());
    if (word == u"null") return {};
    if (word == u"true") return u"True";
    if (word == u"false") return u"False";
    const bool is_number = !word.empty() && (is_decimal_digit(word.front()) || word.front() == u'-') &&
                           word.find_first_not_of(u"0123456789+-.eE") == TextView::npos;
    if (!is_number) fail("has a value that is neither a text nor a number");
    return Text(word);
  }

  TextView rest_;
};

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
      FlatObject(raw()).each([&](const Text& name, const Text&) {
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
    FlatObject(raw()).each([&](const Text& name, Text&& value) {
      const auto column = columns_.find(name);
      if (column == columns_.end())
        throw run_time_failure("has \"" + to_utf8(name) + "\", which the first line has not");
      row[column->second] = std::move(value);
    });
  });
  return true;
}

}  // namespace talutil::cli
