#include <algorithm>
#include <chrono>
#include <filesystem>
#include <iomanip>
#include <iostream>

#include "cli/calling.hpp"
#include "cli/cleaner.hpp"
#include "cli/csv.hpp"
#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "cli/plan.hpp"

namespace talutil::cli {

namespace {

struct CleanOptions {
  std::string csv;
  std::string plan;
  std::string output;                      ///< If empty, the CSV file's name with .sql.
  std::vector<std::string> settings;       ///< NAME=VALUE, put in order before the first row.
  std::string table;                       ///< If empty, the CSV file's name without folder and extension.
  std::optional<std::uint32_t> code_page;  ///< Also used for the files.
};

/// A column of the file, its steps, and statistics.
struct Column {
  std::string name;
  std::vector<PlanStep> steps;
  std::size_t changed = 0;
  Text before;  ///< The first field that changed, and the result.
  Text after;
};

/// The columns in file order. Each must have exactly one line in the plan, so that none is left uncleaned.
std::vector<Column> match_columns(const std::vector<std::string>& header, std::vector<PlanColumn> plan,
                                  const std::string& plan_path, CodePage& page) {
  std::vector<Column> columns;
  for (const std::string& bytes : header) {
    const std::string name = to_utf8(page.text_of(bytes));
    const auto found = std::ranges::find(plan, name, &PlanColumn::name);
    if (found == plan.end()) {
      const bool twice = std::ranges::find(columns, name, &Column::name) != columns.end();
      throw run_time_failure("column \"" + name + "\" " + (twice ? "stands twice" : "has no line in " + plan_path));
    }
    columns.push_back({name, std::move(found->steps), 0, {}, {}});
    plan.erase(found);
  }
  if (!plan.empty())
    throw run_time_failure("there is no column \"" + plan.front().name + "\", which " + plan_path + " names");
  return columns;
}

bool is_plain_name(std::string_view name) {
  const auto fits = [](char c) {
    return c == '_' || (c >= '0' && c <= '9') || (fold_case(c) >= 'a' && fold_case(c) <= 'z');
  };
  return !name.empty() && !(name.front() >= '0' && name.front() <= '9') && std::ranges::all_of(name, fits);
}

std::string in_quotes(std::string_view text, char quote) {
  std::string result(1, quote);
  for (const char c : text) result.append(c == quote ? 2 : 1, c);
  return result + quote;
}

std::string sql_name(std::string_view name) { return is_plain_name(name) ? std::string(name) : in_quotes(name, '"'); }

std::string insert_opening(const std::string& table, const std::vector<Column>& columns, CodePage& page) {
  std::string opening = "INSERT INTO " + sql_name(table);
  std::string_view separator = " (";
  for (const Column& column : columns) {
    opening += separator;
    opening += sql_name(page.bytes_of(from_utf8(column.name)));
    separator = ", ";
  }
  return opening + ") VALUES ";
}

/// Quotes every value, even numbers, because a number may have the user's decimal comma.
void append_value(std::string& sql, std::size_t index, const std::string& value) {
  sql += index == 0 ? "(" : ", ";
  sql += in_quotes(value, '\'');
}

struct Totals {
  std::size_t rows = 0;
  std::string sql;
};

/// Cleans the rows after the header.
Totals clean_rows(CsvReader& reader, const std::string& opening, std::vector<Column>& columns, Cleaner& cleaner,
                  CodePage& page) {
  Totals totals;
  std::vector<std::string> row;
  while (reader.read(row)) {
    const std::string place = "line " + std::to_string(reader.line());
    if (row.size() != columns.size()) {
      throw run_time_failure(place + ": the row has " + std::to_string(row.size()) + " fields, the header " +
                             std::to_string(columns.size()));
    }
    ++totals.rows;
    totals.sql += opening;
    for (std::size_t i = 0; i < row.size(); ++i) {
      Column& column = columns[i];
      const Text before = page.text_of(row[i]);
      Text after =
          within(place + ", column \"" + column.name + "\"", [&] { return cleaner.clean(column.steps, before); });
      append_value(totals.sql, i, page.bytes_of(after));
      if (after == before) continue;
      if (++column.changed > 1) continue;
      column.before = before;
      column.after = std::move(after);
    }
    totals.sql += ");\r\n";
  }
  return totals;
}

/// An excerpt of a text that fits on a line, with control characters made visible.
std::string sample(TextView text) {
  constexpr std::size_t longest = 34;
  const bool is_cut = text.size() > longest;
  return json::text(text.substr(0, longest)) + (is_cut ? "..." : "");
}

void print_columns(const std::vector<Column>& columns) {
  std::size_t width = 0;
  for (const Column& column : columns) width = std::max(width, column.name.size());
  for (const Column& column : columns) {
    std::cout << "  " << std::left << std::setw(static_cast<int>(width)) << column.name << std::right << std::setw(7)
              << column.changed;
    if (column.changed > 0) std::cout << "  " << sample(column.before) << " -> " << sample(column.after);
    std::cout << '\n';
  }
}

void clean(const CleanOptions& options) {
  const auto start = std::chrono::steady_clock::now();
  const std::filesystem::path csv_path(options.csv);
  const std::string output =
      options.output.empty() ? std::filesystem::path(csv_path).replace_extension(".sql").string() : options.output;
  const std::string table = options.table.empty() ? csv_path.stem().string() : options.table;

  std::error_code no_such_file;
  if (std::filesystem::equivalent(csv_path, output, no_such_file)) {
    throw usage_failure("--output " + output + " is the CSV file itself; name another file");
  }

  Session session(options.code_page);
  CodePage& page = *session.platform().code_page;
  put_settings(session, options.settings);
  const std::string plan_text = read_bytes(options.plan);
  auto plan = within(options.plan, [&] { return read_plan(plan_text, Session::members().members, session.locale()); });
  const std::string bytes = read_bytes(options.csv);
  CsvReader reader(bytes);
  Cleaner cleaner(session);
  std::vector<Column> columns;
  const Totals totals = within(options.csv, [&] {
    std::vector<std::string> header;
    if (!reader.read(header)) throw run_time_failure("is empty; its first row must name the columns");
    columns = match_columns(header, std::move(plan), options.plan, page);
    return clean_rows(reader, insert_opening(table, columns, page), columns, cleaner, page);
  });
  write_bytes(output, totals.sql);
  const std::chrono::duration<double> elapsed = std::chrono::steady_clock::now() - start;

  std::cout << totals.rows << " rows of " << columns.size() << " columns; fields changed, with the first of each:\n";
  print_columns(columns);
  std::cout << "CounterVerifyText " << session.settings().CounterVerifyText << ", CounterVerifyInt "
            << session.settings().CounterVerifyInt << '\n'
            << totals.sql.size() << " bytes of inserts to " << output << " in " << std::fixed << std::setprecision(3)
            << elapsed.count() << " s\n";
}

}  // namespace

void add_clean(CLI::App& app, Work& work) {
  const auto options = std::make_shared<CleanOptions>();
  auto* const command = app.add_subcommand("clean", "Clean a CSV file field by field and write it as SQL inserts");
  command->add_option("CSV", options->csv, "The file, with the columns' names in the first row")->required();
  command->add_option("--plan", options->plan, "Which members clean which column (see below)")->required();
  command->add_option("--output", options->output, "The SQL file; default: the CSV file's name with .sql");
  command->add_option("--table", options->table, "The table; default: the CSV file's name");
  add_settings(*command, options->settings, "Change a setting first, for example iCharactercase=1");
  add_code_page(*command, options->code_page, "of both files, also used to compare characters");
  command->footer(
      "A plan has one line per column: its name, a member and the member's arguments before the value.\n"
      "\"|\" passes the result to another member, \"list\" cleans each element of a comma-separated list,\n"
      "\"*\" stands for the value if it is not the last argument, and \"#\" begins a comment:\n"
      "  Name    VerifyTextData 40 0\n"
      "  Amount  VerifyTextData 0 1 | VerifyIntData 1\n"
      "  Tags    list VerifyTextData 20 1\n"
      "  Code    AddZeros * 6 -1");
  choose(*command, work, options, &clean);
}

}  // namespace talutil::cli
