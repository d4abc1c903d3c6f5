#include <algorithm>
#include <chrono>
#include <filesystem>
#include <iomanip>
#include <iostream>
#include <sstream>
#include <unordered_map>

#include "cli/calling.hpp"
#include "cli/cleaner.hpp"
#include "cli/csv.hpp"
#include "cli/encoding.hpp"
#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/json.hpp"
#include "cli/json_lines.hpp"
#include "cli/options.hpp"
#include "cli/plan.hpp"
#include "cli/progress.hpp"
#include "cli/row_writer.hpp"

namespace talutil::cli {

namespace {

struct CleanOptions {
  std::string csv;
  std::string input_format;  ///< "csv" or "jsonl"; if empty, by the file's extension.
  std::string plan;
  std::string output;                 ///< If empty, the CSV file's name with the format's extension.
  std::string bad_rows;               ///< Where rows go that cannot be cleaned; if empty, the first one ends the work.
  std::vector<std::string> settings;  ///< NAME=VALUE, put in order before the first row.
  std::vector<std::string> numbers;   ///< Columns that are written without quotes.
  RowFormat format;
  bool has_line_feeds = false;
  std::optional<std::uint32_t> code_page;  ///< By which members compare characters, and of inputs that are not UTF-8.
  std::string encoding;
  std::string output_encoding = "utf-8";
  bool json = false;
};

/// A column of the file, its steps, and statistics.
struct Column {
  Text name;
  ColumnCleaner cleaner;
  std::size_t changed = 0;
  Text before{};  ///< The first field that changed, and the result.
  Text after{};
};

/// An excerpt of a text that fits on a line, with control characters made visible.
std::string sample(TextView text) {
  constexpr std::size_t longest = 34;
  const bool is_cut = text.size() > longest;
  return json::text(text.substr(0, longest)) + (is_cut ? "..." : "");
}

/// The columns in file order. Each must have exactly one line in the plan, so that none is left uncleaned.
std::vector<Column> match_columns(Session& session, const std::vector<Text>& header, std::vector<PlanColumn> plan,
                                  const std::string& plan_path) {
  std::unordered_map<std::string, PlanColumn*> lines;
  for (PlanColumn& line : plan) lines.emplace(line.name, &line);
  std::unordered_map<std::string, bool> seen;
  std::vector<Column> columns;
  for (const Text& name : header) {
    const auto found = lines.find(to_utf8(name));
    if (!seen.emplace(to_utf8(name), true).second) throw run_time_failure("column " + sample(name) + " stands twice");
    if (found == lines.end()) throw run_time_failure("column " + sample(name) + " has no line in " + plan_path);
    columns.push_back({name, ColumnCleaner(session, std::move(found->second->steps))});
  }
  for (const PlanColumn& line : plan) {
    if (!seen.contains(line.name)) {
      throw run_time_failure("there is no column \"" + line.name + "\", which " + plan_path + " names");
    }
  }
  return columns;
}

/// Which columns are written as numbers.
std::vector<bool> number_columns(const std::vector<Text>& header, const std::vector<std::string>& names) {
  std::vector<bool> is_number(header.size());
  for (const std::string& name : names) {
    const auto found = std::ranges::find(header, utf8_text(name, "--numbers"));
    if (found == header.end()) throw usage_failure("--numbers: there is no column \"" + name + "\"");
    is_number[static_cast<std::size_t>(found - header.begin())] = true;
  }
  return is_number;
}

/// The rows that could not be cleaned, collected as they are in the input, below its header.
class BadRows {
 public:
  explicit BadRows(const std::string& path) : path_(path) {
    if (!path_.empty()) output_.emplace(path_);
  }

  [[nodiscard]] bool are_collected() const noexcept { return output_.has_value(); }
  [[nodiscard]] std::size_t count() const noexcept { return count_; }

  void begin(TextView header) {
    if (output_) output_->write(to_utf8(header) + "\n");
  }

  void add(TextView row, const std::string& reason) {
    constexpr std::size_t most_named = 10;
    output_->write(to_utf8(row) + "\n");
    if (++count_ <= most_named) warn(reason);
    if (count_ == most_named + 1) warn("more bad rows are collected in " + shown_output(path_));
  }

  void close() {
    if (output_) output_->close();
  }

 private:
  std::string path_;
  std::optional<Output> output_;
  std::size_t count_ = 0;
};

bool is_json_lines(const CleanOptions& options) {
  if (options.input_format == "jsonl") return true;
  if (options.input_format == "csv") return false;
  if (!options.input_format.empty()) {
    throw usage_failure("--input-format " + options.input_format +
                        ": there is no such format; there are csv and jsonl");
  }
  return std::filesystem::path(options.csv).extension() == ".jsonl";
}

/// The work of the subcommand: one input, its columns and its output.
class Cleaning {
 public:
  explicit Cleaning(const CleanOptions& options)
      : options_(options),
        source_(shown_input(options.csv)),
        session_(options.code_page),
        input_(options.csv),
        decoder_(source_, {options.encoding, options.code_page}),
        encoder_(encoding_named(options.output_encoding, "--output-encoding")),
        progress_("cleaning") {
    put_settings(session_, options.settings);
  }

  int run(const std::string& output_path) {
    std::string plan_text = read_bytes(options_.plan);
    auto plan =
        within(options_.plan, [&] { return read_plan(plan_text, Session::members().members, session_.locale()); });
    const auto reader = make_reader();
    within(source_, [&] {
      if (!reader->read(row_)) throw run_time_failure("is empty; its first row must name the columns");
      columns_ = match_columns(session_, row_, std::move(plan), options_.plan);
    });
    RowFormat format = options_.format;
    format.is_number = number_columns(row_, options_.numbers);
    format.line_end = options_.has_line_feeds ? u"\n" : u"\r\n";
    const auto writer = make_row_writer(format, row_);
    BadRows bad_rows(options_.bad_rows);
    if (!is_json_lines(options_)) bad_rows.begin(reader->raw());
    Output output(output_path);
    output.write(encoder_.mark());
    writer->begin(text_);
    within(source_, [&] { clean_rows(*reader, *writer, output, bad_rows); });
    writer->end(text_);
    flush(output);
    output.close();
    bad_rows.close();
    bad_count_ = bad_rows.count();
    return bad_count_ == 0 ? 0 : partial_status;
  }

  void print_summary(const std::string& output_path, double seconds) {
    if (encoder_.is_lossy()) {
      warn("code page " + options_.output_encoding + " lacks some of the characters; they were replaced");
    }
    if (options_.json)
      print_json(output_path, seconds);
    else
      print_words(output_path, seconds);
  }

 private:
  [[nodiscard]] std::unique_ptr<RowReader> make_reader() {
    const auto source = [this](Text& text) { return read_piece(text); };
    if (is_json_lines(options_)) return std::make_unique<JsonLinesReader>(source);
    return std::make_unique<CsvReader>(source);
  }

  bool read_piece(Text& text) {
    const std::size_t count = input_.read(buffer_);
    decoder_.decode(std::string_view(buffer_).substr(0, count), count == 0, text);
    progress_.show(input_.done(), input_.size());
    return count != 0;
  }

  void clean_rows(RowReader& reader, RowWriter& writer, Output& output, BadRows& bad_rows) {
    for (;;) {
      try {
        if (!reader.read(row_)) return;
        clean_row(reader);
        writer.add(text_, row_);
        ++rows_;
      } catch (const InputFailure&) {
        throw;
      } catch (const Failure& failure) {
        if (!bad_rows.are_collected()) throw;
        bad_rows.add(reader.raw(), source_ + ": " + failure.what());
      }
      constexpr std::size_t enough = 1U << 15U;
      if (text_.size() > enough) flush(output);
    }
  }

  void clean_row(const RowReader& reader) {
    if (row_.size() != columns_.size()) {
      throw run_time_failure("line " + std::to_string(reader.line()) + ": the row has " + std::to_string(row_.size()) +
                             " fields, the header " + std::to_string(columns_.size()));
    }
    for (std::size_t i = 0; i < row_.size(); ++i) {
      Column& column = columns_[i];
      before_ = row_[i];
      try {
        column.cleaner.clean(row_[i]);
      } catch (const Failure& failure) {
        throw Failure(
            failure.status(),
            "line " + std::to_string(reader.line()) + ", column \"" + to_utf8(column.name) + "\": " + failure.what(),
            failure.number());
      }
      if (row_[i] == before_ || ++column.changed > 1) continue;
      column.before = before_;
      column.after = row_[i];
    }
  }

  void flush(Output& output) {
    bytes_.clear();
    encoder_.append(bytes_, text_);
    written_ += bytes_.size();
    output.write(bytes_);
    text_.clear();
  }

  void print_words(const std::string& output_path, double seconds) {
    std::ostringstream words;
    words << rows_ << " rows of " << columns_.size() << " columns; fields changed, with the first of each:\n";
    std::size_t width = 0;
    for (const Column& column : columns_) width = std::max(width, column.name.size());
    for (const Column& column : columns_) {
      words << "  " << to_utf8(column.name) << std::string(width - column.name.size(), ' ') << std::setw(9)
            << column.changed;
      if (column.changed > 0) words << "  " << sample(column.before) << " -> " << sample(column.after);
      words << '\n';
    }
    words << "values cleaned: " << session_.settings().CounterVerifyText << " texts (CounterVerifyText), "
          << session_.settings().CounterVerifyInt << " numbers (CounterVerifyInt)\n";
    if (bad_count_ > 0) words << bad_count_ << " bad rows in " << shown_output(options_.bad_rows) << '\n';
    words << written_ << " bytes to " << shown_output(output_path) << " in " << std::fixed << std::setprecision(3)
          << seconds << " s\n";
    std::cerr << words.str();
  }

  /// On standard error if the rows are on standard output.
  void print_json(const std::string& output_path, double seconds) {
    std::vector<std::string> columns;
    for (const Column& column : columns_) {
      columns.push_back(json::object({{"name", json::text(column.name)}, {"changed", std::to_string(column.changed)}}));
    }
    (output_path == "-" ? std::cerr : std::cout) << json::object({{"rows", std::to_string(rows_)},
                                                                  {"bad_rows", std::to_string(bad_count_)},
                                                                  {"columns", json::array(columns)},
                                                                  {"bytes", std::to_string(written_)},
                                                                  {"output", json::text(std::string_view(output_path))},
                                                                  {"seconds", std::to_string(seconds)}})
                                                 << '\n';
  }

  const CleanOptions& options_;
  std::string source_;
  Session session_;
  Input input_;
  Decoder decoder_;
  Encoder encoder_;
  ProgressLine progress_;
  std::vector<Column> columns_;
  std::vector<Text> row_;
  Text before_;
  Text text_;
  std::string bytes_;
  std::string buffer_ = std::string(std::size_t{1} << 18U, '\0');
  std::size_t rows_ = 0;
  std::size_t bad_count_ = 0;
  std::uint64_t written_ = 0;
};

std::string output_of(const CleanOptions& options) {
  if (!options.output.empty()) return options.output;
  if (options.csv == "-") return "-";
  const bool is_same = options.format.name == (is_json_lines(options) ? "jsonl" : "csv");
  const std::string extension = (is_same ? "cleaned." : "") + options.format.name;
  return std::filesystem::path(options.csv).replace_extension(extension).string();
}

/// Fails if an output is one of the inputs, which would be lost.
void require_other_file(const CleanOptions& options, const std::string& option, const std::string& output) {
  std::error_code no_such_file;
  for (const std::string& input : {options.csv, options.plan}) {
    if (!std::filesystem::is_regular_file(output, no_such_file)) continue;
    if (std::filesystem::equivalent(input, output, no_such_file)) {
      throw usage_failure(option + " " + output + " is the input itself; name another file");
    }
  }
}

int clean(CleanOptions& options) {
  const auto start = std::chrono::steady_clock::now();
  const std::string output = output_of(options);
  require_other_file(options, "--output", output);
  require_other_file(options, "--bad-rows", options.bad_rows);
  if (options.format.table.empty() && options.csv != "-") {
    options.format.table = std::filesystem::path(options.csv).stem().string();
  }
  if (options.format.table.empty() && options.format.name == "sql") {
    throw usage_failure("--table is required with standard input; name the table of the inserts");
  }
  Cleaning cleaning(options);
  const int status = cleaning.run(output);
  const std::chrono::duration<double> elapsed = std::chrono::steady_clock::now() - start;
  cleaning.print_summary(output, elapsed.count());
  return status;
}

}  // namespace

void add_clean(CLI::App& app, Work& work) {
  const auto options = std::make_shared<CleanOptions>();
  auto* const command =
      app.add_subcommand("clean", "Clean a table field by field and write it as SQL, CSV or JSON lines");
  command
      ->add_option("CSV", options->csv,
                   "The table: CSV with the columns' names in the first row, or JSON lines; - is standard input")
      ->required();
  command->add_option("--input-format", options->input_format, "csv or jsonl; default: by the file's extension");
  command->add_option("--plan", options->plan, "Which members clean which column (see below)")->required();
  command->add_option("--output", options->output,
                      "The file to write; default: the CSV file's name with .sql; - is standard output");
  command->add_option("--format", options->format.name, "sql, csv or jsonl (JSON lines)")->capture_default_str();
  command->add_option("--table", options->format.table, "The table of SQL inserts; default: the CSV file's name");
  command->add_option("--numbers", options->numbers, "Columns whose numbers are written without quotes: Amount,Count")
      ->delimiter(',')
      ->allow_extra_args(false)
      ->type_name("COLUMNS");
  command->add_flag("--empty-null", options->format.empty_is_null, "Write empty values as NULL");
  command->add_flag("--transaction", options->format.in_transaction, "Put SQL inserts between BEGIN and COMMIT");
  command->add_flag("--line-feeds", options->has_line_feeds, "End lines with a line feed alone, not with CR and LF");
  command->add_option("--bad-rows", options->bad_rows,
                      "Collect rows that cannot be cleaned in this file and go on (exit code 4)");
  add_settings(*command, options->settings, "Change a setting first, for example iCharactercase=1");
  add_encoding(*command, options->encoding);
  command->add_option("--output-encoding", options->output_encoding, "utf-8, utf-16 or a code page")
      ->capture_default_str();
  add_code_page(*command, options->code_page, "of input that is not UTF-8, also used to compare characters");
  add_json(*command, options->json, "Print the summary as JSON");
  command->footer(
      "A plan has one line per column: its name, a member and the member's arguments before the value.\n"
      "\"|\" passes the result to another member, \"list\" cleans each element of a comma-separated list,\n"
      "\"*\" stands for the value if it is not the last argument, and \"#\" begins a comment. Names with blanks\n"
      "are in double quotes:\n"
      "  Name         VerifyTextData 40 0\n"
      "  Amount       VerifyTextData 0 1 | VerifyIntData 1    # digits only\n"
      "  Tags         list VerifyTextData 20 1\n"
      "  \"Post code\"  AddZeros * 6 -1");
  choose(*command, work, options, &clean);
}

}  // namespace talutil::cli
