#include "cli/row_writer.hpp"

#include <algorithm>

#include "automation/numbers.hpp"
#include "cli/failure.hpp"
#include "controls/delimited_text.hpp"

namespace talutil::cli {

namespace {

void append_quoted(Text& text, TextView value, char16_t quote) {
  text += quote;
  for (std::size_t at = 0; at < value.size();) {
    const std::size_t end = std::min(value.find(quote, at), value.size());
    text += value.substr(at, end - at);
    if (end < value.size()) text.append(2, quote);
    at = end + 1;
  }
  text += quote;
}

bool is_plain_name(TextView name) {
  const auto fits = [](char16_t c) {
    return c == u'_' || is_decimal_digit(c) || (c >= u'A' && c <= u'Z') || (c >= u'a' && c <= u'z');
  };
  return !name.empty() && !is_decimal_digit(name.front()) && std::ranges::all_of(name, fits);
}

void append_name(Text& text, TextView name) {
  if (is_plain_name(name))
    text += name;
  else
    append_quoted(text, name, u'"');
}

/// Whether a value is a number both in SQL and in JSON: "-12", "1.50", but not "007", "1.", ".5" or "1,50".
bool is_number(TextView value) {
  if (value.starts_with(u'-')) value.remove_prefix(1);
  const std::size_t whole = std::min(value.find(u'.'), value.size());
  const TextView before = value.substr(0, whole);
  const TextView after = value.substr(std::min(whole + 1, value.size()));
  const auto are_digits = [](TextView digits) {
    return !digits.empty() && std::ranges::all_of(digits, is_decimal_digit);
  };
  if (!are_digits(before) || (before.size() > 1 && before.front() == u'0')) return false;
  return whole == value.size() || are_digits(after);
}

class SqlWriter final : public RowWriter {
 public:
  SqlWriter(const RowFormat& format, const std::vector<Text>& columns) : format_(format) {
    opening_ = u"INSERT INTO ";
    append_name(opening_, from_utf8(format_.table));
    TextView separator = u" (";
    for (const Text& column : columns) {
      opening_ += separator;
      append_name(opening_, column);
      separator = u", ";
    }
    opening_ += u") VALUES ";
  }

  void begin(Text& text) override {
    if (format_.in_transaction) text += u"BEGIN;" + Text(format_.line_end);
  }

  /// Quotes values, even numbers, because a number may have the user's decimal comma.
  void add(Text& text, const std::vector<Text>& row) override {
    text += opening_;
    for (std::size_t i = 0; i < row.size(); ++i) {
      text += i == 0 ? TextView(u"(") : TextView(u", ");
      if (row[i].empty() && format_.empty_is_null)
        text += u"NULL";
      else if (format_.is_number[i] && is_number(row[i]))
        text += row[i];
      else
        append_quoted(text, row[i], u'\'');
    }
    text += u");";
    text += format_.line_end;
  }

  void end(Text& text) override {
    if (format_.in_transaction) text += u"COMMIT;" + Text(format_.line_end);
  }

 private:
  RowFormat format_;
  Text opening_;
};

class CsvWriter final : public RowWriter {
 public:
  CsvWriter(const RowFormat& format, std::vector<Text> columns) : format_(format), columns_(std::move(columns)) {}

  void begin(Text& text) override { add(text, columns_); }

  void add(Text& text, const std::vector<Text>& row) override {
    for (std::size_t i = 0; i < row.size(); ++i) {
      if (i > 0) text += u',';
      append_delimited(text, row[i], u',');
    }
    // A line with one empty field would be an empty line, which readers pass over.
    if (row.size() == 1 && row.front().empty()) text += u"\"\"";
    text += format_.line_end;
  }

  void end(Text& /*text*/) override {}

 private:
  RowFormat format_;
  std::vector<Text> columns_;
};

void append_json(Text& text, TextView value) {
  constexpr TextView digits = u"0123456789abcdef";
  text += u'"';
  for (const char16_t unit : value) {
    if (unit == u'"' || unit == u'\\') {
      text += u'\\';
      text += unit;
    } else if (unit < u' ' || unit == u'\x7F' || (unit & 0xF800) == 0xD800) {
      text += u"\\u";
      for (const unsigned shift : {12U, 8U, 4U, 0U}) text += digits[unit >> shift & 15U];
    } else {
      text += unit;
    }
  }
  text += u'"';
}

class JsonLinesWriter final : public RowWriter {
 public:
  JsonLinesWriter(const RowFormat& format, const std::vector<Text>& columns) : format_(format) {
    for (std::size_t i = 0; i < columns.size(); ++i) {
      Text& opening = openings_.emplace_back(i == 0 ? u"{" : u", ");
      append_json(opening, columns[i]);
      opening += u": ";
    }
  }

  void begin(Text& /*text*/) override {}

  void add(Text& text, const std::vector<Text>& row) override {
    for (std::size_t i = 0; i < row.size(); ++i) {
      text += openings_[i];
      if (row[i].empty() && format_.empty_is_null)
        text += u"null";
      else if (format_.is_number[i] && is_number(row[i]))
        text += row[i];
      else
        append_json(text, row[i]);
    }
    text += u"}\n";
  }

  void end(Text& /*text*/) override {}

 private:
  RowFormat format_;
  std::vector<Text> openings_;
};

}  // namespace

std::unique_ptr<RowWriter> make_row_writer(const RowFormat& format, const std::vector<Text>& columns) {
  if (format.name == "sql") return std::make_unique<SqlWriter>(format, columns);
  if (format.name == "csv") return std::make_unique<CsvWriter>(format, columns);
  if (format.name == "jsonl") return std::make_unique<JsonLinesWriter>(format, columns);
  throw usage_failure("--format " + format.name + ": there is no such format; there are sql, csv and jsonl");
}

}  // namespace talutil::cli
