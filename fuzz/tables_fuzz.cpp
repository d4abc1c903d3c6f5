// Checks what must hold for any table in a text, quoted or in columns: tables_fuzz -max_len=512 -runs=1000000
#include <algorithm>
#include <optional>

#include "cli/csv.hpp"
#include "cli/failure.hpp"
#include "controls/delimited_text.hpp"
#include "fuzz/host.hpp"
#include "fuzz/input.hpp"

namespace talutil {
namespace {

using fuzz::require;
using Table = std::vector<std::vector<Text>>;

Text written(const Table& table, char16_t separator) {
  Text text;
  for (const auto& row : table) {
    for (std::size_t i = 0; i < row.size(); ++i) {
      if (i > 0) text += separator;
      append_delimited(text, row[i], separator);
    }
    text += u"\r\n";
  }
  return text;
}

/// The command passes over empty lines.
Table without_empty_rows(Table table) {
  std::erase_if(table, [](const std::vector<Text>& row) { return row == std::vector<Text>{u""}; });
  return table;
}

/// Nothing if the command's reader, which is strict, rejects the text. It gets a few characters at a time.
std::optional<Table> read_by_command(TextView text) {
  constexpr std::size_t most = 7;
  try {
    Table table;
    cli::CsvReader reader([&](Text& buffer) {
      buffer += text.substr(0, most);
      const bool is_more = !text.empty();
      text.remove_prefix(std::min(most, text.size()));
      return is_more;
    });
    for (std::vector<Text> row; reader.read(row);) table.push_back(row);
    return without_empty_rows(table);
  } catch (const cli::Failure&) {
    return std::nullopt;
  }
}

void check_quoted(fuzz::Input& input, const Text& text) {
  const char16_t separator = u",;\t"[input.byte() % 3];
  const Table table = read_delimited(text, separator);
  const Text again = written(table, separator);
  require(read_delimited(again, separator) == table, "a table comes back");
  if (separator != u',') return;
  require(read_by_command(again) == without_empty_rows(table), "and is read by the command");
  // For the command a carriage return alone is data.
  Text lines = text;
  std::erase(lines, u'\r');
  const auto by_command = read_by_command(lines);
  require(!by_command || *by_command == without_empty_rows(read_delimited(lines, separator)),
          "both readers read the same");
}

void check_fixed(const Text& text) {
  std::size_t widest = 0;
  Text kept;
  for (const auto& row : read_fixed(text)) {
    widest = std::max(widest, row.size());
    for (const Text& cell : row) {
      require(!cell.ends_with(u' '), "no blank ends a cell");
      kept += cell;
    }
  }
  const auto without_blanks = [](Text whole) {
    std::erase_if(whole, [](char16_t unit) { return unit == u' ' || unit == u'\r' || unit == u'\n'; });
    return whole;
  };
  require(without_blanks(kept) == without_blanks(text), "every character is in a cell");
  require(widest <= 1 + text.size() / 3, "columns are three characters apart");
}

void check_file(fuzz::Host& host, const Text& text) {
  const bool is_wide = !host.code_page().holds(text);
  TableFile file(host.files(), host.code_page(), u"C:\\table.txt", is_wide);
  file.write(text);
  file.close();
  const Text read = read_table_file(host.files(), host.code_page(), u"C:\\table.txt");
  require(read == (is_wide ? from_utf8(to_utf8(text)) : text), "a file holds its text");
}

void check(fuzz::Input input) {
  static fuzz::Host host;
  const Text text = input.text(40);
  // A text that the code page holds and that begins like the mark would be read as one.
  if (!to_ansi(text).starts_with("\xEF\xBB\xBF")) check_file(host, text);
  fuzz::Input choices = input;
  const Text table = from_ansi(to_ansi(input.text(255)));
  check_quoted(choices, table);
  check_fixed(table);
  host.put_file(u"C:\\given.txt", input.rest());
  (void)read_table_file(host.files(), host.code_page(), u"C:\\given.txt");
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  talutil::check({data, size, u"ab,,;\t\"\"  \r\n\u00E9\u0416"});
  return 0;
}
