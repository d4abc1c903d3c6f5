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

/// Nothing if the command's reader, which is strict, rejects the bytes.
std::optional<Table> read_by_command(std::string_view bytes) {
  try {
    Table table;
    cli::CsvReader reader(bytes);
    for (std::vector<std::string> row; reader.read(row);) {
      auto& cells = table.emplace_back();
      for (const std::string& cell : row) cells.push_back(from_ansi(cell));
    }
    return table;
  } catch (const cli::Failure&) {
    return std::nullopt;
  }
}

void check_both_readers(const std::string& bytes, const Table& expected) {
  const auto table = read_by_command(bytes);
  require(!table || *table == expected, "both readers read the same");
}

void check_quoted(fuzz::Input& input, const std::string& bytes) {
  const char16_t separator = u",;\t"[input.byte() % 3];
  const Text text = from_ansi(bytes);
  const Table table = read_delimited(text, separator);
  const Text again = written(table, separator);
  require(read_delimited(again, separator) == table, "a table comes back");
  if (separator != u',') return;
  require(read_by_command(to_ansi(again)) == table, "and is read by the command");
  // For the command a carriage return alone is data.
  std::string lines = bytes;
  std::erase(lines, '\r');
  check_both_readers(lines, read_delimited(from_ansi(lines), separator));
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
  const std::string bytes = to_ansi(input.text(255));
  check_quoted(choices, bytes);
  check_fixed(from_ansi(bytes));
  host.put_file(u"C:\\given.txt", input.rest());
  (void)read_table_file(host.files(), host.code_page(), u"C:\\given.txt");
}

}  // namespace
}  // namespace talutil

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  talutil::check({data, size, u"ab,,;\t\"\"  \r\n\u00E9\u0416"});
  return 0;
}
