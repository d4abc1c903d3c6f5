#include <algorithm>
#include <filesystem>

#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/options.hpp"
#include "controls/grid.hpp"
#include "controls/print_control.hpp"
#include "platform/posix/posix_platform.hpp"

namespace talutil::cli {

namespace {

struct ReportOptions {
  std::string file;  ///< A table (.csv), or a text.
  std::string title;
  std::string paper = "A4";
  bool landscape = false;
  std::string pdf;  ///< If empty, the file's name with .pdf.
};

constexpr std::int16_t comma_text = 3;

/// Decodes UTF-8 or, if it is not that, code page 1252, which hosts' files use.
Text text_of_file(const std::string& path) {
  const std::string bytes = read_bytes(path);
  Text text = from_utf8(bytes);
  return text.find(u'\uFFFD') == Text::npos ? text : from_ansi(bytes);
}

/// Makes columns as wide as their longest text, up to a limit.
void fit_columns(Grid& grid) {
  constexpr std::int32_t character = 100;  // Twips of the grid's letters, Courier of 8 points.
  constexpr std::int32_t padding = 130;
  constexpr std::int32_t widest = 5000;
  for (std::int32_t c = 0; c < grid.Cols(); ++c) {
    std::size_t longest = 3;
    for (std::int32_t r = 0; r < grid.Rows(); ++r) longest = std::max(longest, grid.TextMatrix(r, c).size());
    grid.put_ColWidth(c, std::min(widest, static_cast<std::int32_t>(longest) * character + padding));
  }
}

void add_table(PrintControl& print, const Platform& platform, const std::string& path) {
  const auto grid = std::make_shared<Grid>(platform);
  grid->LoadGrid(utf8_text(path, "the file's name"), comma_text, Boolean(true));
  if (grid->Rows() > 0) grid->put_FixedRows(1);
  fit_columns(*grid);
  grid->WordWrap = Boolean(true);
  print.RenderObject = ObjectRef(grid);
  print.put_RenderControl(0);
}

void report(const ReportOptions& options) {
  posix::PosixPlatform posix_platform;
  const Platform platform = posix_platform.platform();
  const std::filesystem::path source(options.file);
  const std::string output =
      options.pdf.empty() ? std::filesystem::path(source).replace_extension(".pdf").string() : options.pdf;
  if (output == options.file) throw usage_failure(options.file + ": give --pdf another name");
  const std::string title = options.title.empty() ? source.stem().string() : options.title;

  const auto print = std::make_shared<PrintControl>(platform);
  print->put_PaperSize(options.paper == "A3" ? 8 : 9);
  print->put_Orientation(options.landscape ? 1 : 0);
  print->Header = u"  " + utf8_text(title, "--title");
  print->StartDoc();
  try {
    if (source.extension() == ".csv")
      add_table(*print, platform, options.file);
    else
      print->put_Text(text_of_file(options.file));
  } catch (const RunTimeError& error) {
    throw run_time_failure(options.file + ": " + error_words(error));
  }
  print->EndDoc();
  try {
    PdfExport(platform).ConvertDocument(ObjectRef(print), utf8_text(output, "--pdf"));
  } catch (const RunTimeError& error) {
    throw run_time_failure(output + ": " + error_words(error));
  }
}

}  // namespace

void add_report(CLI::App& app, Work& work) {
  const auto options = std::make_shared<ReportOptions>();
  auto* const command = app.add_subcommand("report", "Lay out a table or a text on pages and write them as PDF");
  command
      ->add_option("FILE", options->file, "A comma-separated table (.csv, with headings in the first line) or a text")
      ->required();
  command->add_option("--title", options->title, "The header of every page; default: the file's name");
  command->add_option("--paper", options->paper, "A4 or A3")->check(CLI::IsMember({"A4", "A3"}));
  command->add_flag("--landscape", options->landscape, "Use landscape orientation");
  command->add_option("--pdf", options->pdf, "The file to write; default: FILE with .pdf");
  choose(*command, work, options, &report);
}

}  // namespace talutil::cli
