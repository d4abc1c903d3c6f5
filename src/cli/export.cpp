#include <charconv>

#include "automation/control.hpp"
#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/options.hpp"
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
  if (first >= grid.Rows() || last >= grid.Rows()) {
    throw usage_failure("--rows: there is no row " + std::to_string(std::max(first, last)) + "; " + options.table +
                        " has rows 0 to " + std::to_string(grid.Rows() - 1));
  }
  grid.put_Row(first);
  grid.put_RowSel(last);
}

/// Does some work on a file; reports a run-time error with the file's name.
template <class Work>
void on_file(const std::string& path, Work work) {
  try {
    work();
  } catch (const RunTimeError& error) {
    throw run_time_failure(path + ": " + error_words(error));
  }
}

void export_table(const ExportOptions& options) {
  constexpr auto comma_text = static_cast<std::int16_t>(Grid::Format::comma_text);
  posix::PosixPlatform platform;
  const auto source = std::make_shared<Grid>(platform.platform());
  on_file(options.table, [&] { source->LoadGrid(utf8_text(options.table, "--from"), comma_text, Boolean(true)); });
  hide_columns(*source, options);
  if (!options.rows.empty()) select_rows(*source, options);

  on_file(options.output, [&] {
    const Control grid(source, platform.computer.locale());
    const Control scratch(std::make_shared<Grid>(platform.platform()), platform.computer.locale());
    GridExport work(grid, scratch);
    if (options.rows.empty())
      work.copy_all_rows(0);
    else
      work.copy_selected_rows();
    work.save(utf8_text(options.output, "the file's name"), true);
  });
}

}  // namespace

void add_export(CLI::App& app, Work& work) {
  const auto options = std::make_shared<ExportOptions>();
  auto* const command = app.add_subcommand("export", "Write the visible rows and columns of a table, as a grid does");
  command->add_option("--from", options->table, "The table, comma-separated; its first line, the header, is row 0")
      ->required()
      ->type_name("FILE");
  command->add_option("--hide", options->hidden, "Columns to leave out, counted from 1: 2,5")
      ->delimiter(',')
      ->allow_extra_args(false)
      ->type_name("COLUMNS");
  command->add_option("--rows", options->rows, "The rows to write, for example 3-7; default: all")
      ->type_name("FIRST-LAST");
  command->add_option("FILE", options->output, "The file to write, comma-separated")->required();
  choose(*command, work, options, &export_table);
}

}  // namespace talutil::cli
