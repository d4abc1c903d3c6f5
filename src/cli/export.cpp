#include <charconv>
#include <iostream>

#include "automation/control.hpp"
#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "cli/table.hpp"
#include "controls/grid.hpp"
#include "forms/grid_export.hpp"
#include "platform/posix/posix_platform.hpp"

namespace talutil::cli {

namespace {

struct ExportOptions {
  std::string table;                ///< A comma-separated file; its first line is row 0.
  std::vector<std::string> hidden;  ///< Columns, counted from 1.
  std::string rows;                 ///< "3-7" or "3"; empty for all.
  std::string output;
  InputEncoding encoding;
  bool json = false;
};

/// A word as a whole number.
std::int32_t number_of(std::string_view word, const std::string& option) {
  std::int32_t number = -1;
  const auto [end, status] = std::from_chars(word.data(), word.data() + word.size(), number);
  if (status != std::errc{} || end != word.data() + word.size() || number < 0) {
    throw usage_failure(option + ": \"" + std::string(word) + "\" is not a number");
  }
  return number;
}

void hide_columns(Grid& grid, const ExportOptions& options) {
  for (const std::string& word : options.hidden) {
    const std::int32_t column = number_of(word, "--hide");
    if (column < 1 || column > grid.Cols()) {
      throw usage_failure("--hide: there is no column " + word + "; " + options.table + " has columns 1 to " +
                          std::to_string(grid.Cols()));
    }
    grid.put_ColHidden(column - 1, Boolean(true));
  }
}

/// Selects rows, given as "3-7" or "3".
void select_rows(Grid& grid, const ExportOptions& options) {
  const std::size_t dash = options.rows.find('-');
  const std::int32_t first = number_of(options.rows.substr(0, dash), "--rows");
  const std::int32_t last = dash == std::string::npos ? first : number_of(options.rows.substr(dash + 1), "--rows");
  if (first > last) throw usage_failure("--rows " + options.rows + ": the first row is after the last");
  if (first >= grid.Rows() || last >= grid.Rows()) {
    throw usage_failure("--rows: there is no row " + std::to_string(std::max(first, last)) + "; " + options.table +
                        " has rows 0 to " + std::to_string(grid.Rows() - 1));
  }
  grid.put_Row(first);
  grid.put_RowSel(last);
}

void export_table(const ExportOptions& options) {
  posix::PosixPlatform platform;
  platform.files.allow_streams();
  const auto source = std::make_shared<Grid>(platform.platform());
  read_table(options.table, options.encoding, *source);
  hide_columns(*source, options);
  if (!options.rows.empty()) select_rows(*source, options);

  on_file(options.output, [&] {
    const Control grid(source, platform.computer.locale());
    const Control scratch(std::make_shared<Grid>(platform.platform()), platform.computer.locale());
    GridExport work(platform.platform(), grid, scratch);
    if (options.rows.empty())
      work.copy_all_rows(0);
    else
      work.copy_selected_rows();
    work.save(output_path(options.output), true);
  });
  if (!options.json) return;
  (options.output == "-" ? std::cerr : std::cout)
      << json::object({{"rows", std::to_string(source->Rows())},
                       {"columns", std::to_string(source->Cols())},
                       {"output", json::text(std::string_view(options.output))}})
      << '\n';
}

}  // namespace

void add_export(CLI::App& app, Work& work) {
  const auto options = std::make_shared<ExportOptions>();
  auto* const command = app.add_subcommand("export", "Write chosen rows and columns of a CSV file");
  command
      ->add_option("--from", options->table,
                   "The table, comma-separated; its first line, the header, is row 0; - is standard input")
      ->required()
      ->type_name("FILE");
  command->add_option("--hide", options->hidden, "Columns to leave out, counted from 1: 2,5")
      ->delimiter(',')
      ->allow_extra_args(false)
      ->type_name("COLUMNS");
  command->add_option("--rows", options->rows, "The rows to write, for example 3-7; default: all")
      ->type_name("FIRST-LAST");
  command->add_option("FILE", options->output, "The file to write, comma-separated; - is standard output")->required();
  add_encoding(*command, options->encoding.name);
  add_json(*command, options->json, "Print what was written as JSON");
  choose(*command, work, options, &export_table);
}

}  // namespace talutil::cli
