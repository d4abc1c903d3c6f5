#include <stdio.h>

#include <algorithm>
#include <array>
#include <filesystem>
#include <iostream>
#include <set>
#include <sstream>
#include <utility>

#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "cli/report_table.hpp"
#include "controls/grid.hpp"
#include "controls/print_control.hpp"
#include "documents/arabic_joining.hpp"
#include "documents/text_direction.hpp"
#include "platform/posix/posix_platform.hpp"

namespace talutil::cli {

namespace {

struct ReportOptions {
  std::string file;  ///< A table (.csv), or a text.
  std::string kind;  ///< "table" or "text"; if empty, by the file's extension.
  std::string title;
  std::string period;
  std::string author;
  std::string subject;
  std::string paper = "A4";
  std::string font = "proportional";
  std::string font_file;
  std::vector<std::string> columns;
  std::vector<std::string> totals;
  std::int32_t keys = 1;
  bool landscape = false;
  std::string pdf;  ///< If empty, the file's name with .pdf.
  InputEncoding encoding;
  bool json = false;
};

struct Paper {
  const char* name;
  std::int32_t code;  ///< Of the platform's printing functions.
};
constexpr Paper papers[] = {{"A3", 8}, {"A4", 9}, {"A5", 11}, {"Letter", 1}, {"Legal", 5}, {"Tabloid", 3}};

std::string fold(std::string word) {
  std::ranges::transform(word, word.begin(), [](char c) { return fold_case(c); });
  return word;
}

std::int32_t paper_code(const std::string& name) {
  std::string names;
  for (const Paper& paper : papers) {
    if (fold(paper.name) == fold(name)) return paper.code;
    names += (names.empty() ? "" : ", ") + std::string(paper.name);
  }
  throw usage_failure("--paper " + name + ": there is no such paper; there are " + names);
}

bool is_table(const ReportOptions& options) {
  if (options.kind == "table") return true;
  if (options.kind == "text") return false;
  if (!options.kind.empty()) throw usage_failure("--as " + options.kind + ": write table or text");
  return fold(std::filesystem::path(options.file).extension().string()) == ".csv";
}

Text font_name(const ReportOptions& options) {
  if (options.font == "proportional") return u"Helvetica";
  if (options.font == "fixed") return u"Courier New";
  if (options.font == "serif") return u"Times";
  throw usage_failure("--font " + options.font + ": there is no such font; there are proportional, fixed and serif");
}

Text header_of(const ReportOptions& options) {
  const std::string name = options.file == "-" ? "" : std::filesystem::path(options.file).stem().string();
  Text header = utf8_text(options.title.empty() ? name : options.title, "--title");
  if (!options.period.empty()) header += u"\n" + utf8_text(options.period, "--period");
  return header;
}

/// What the report shows.
struct Contents {
  std::shared_ptr<Grid> table;  ///< Null for a text.
  Text text;
  Text header;
};

Contents read_contents(const ReportOptions& options, const Platform& platform) {
  Contents contents;
  contents.header = header_of(options);
  if (is_table(options)) {
    contents.table = std::make_shared<Grid>(platform);
    ColumnChoice choose;
    if (!options.columns.empty()) {
      choose = [&](const std::vector<Text>& headings) { return columns_of(headings, options.columns, "--columns"); };
    }
    const std::size_t headings = read_table(options.file, options.encoding, *contents.table, choose);
    add_totals(*contents.table, headings, options.totals, platform.computer.locale());
  } else {
    contents.text = read_text(options.file, options.encoding);
    require_text(contents.text, options.file);
  }
  return contents;
}

/// The characters that no font has.
std::set<Text> missing_characters(const Contents& contents, FontMetrics& metrics, const FontStyle& font) {
  std::set<Text> missing;
  const auto look_at = [&](TextView read) {
    if (std::ranges::none_of(read, FontMetrics::is_wide)) return;
    const Text text = joined(read);
    for (std::size_t i = 0; i < text.size(); ++i) {
      if (!FontMetrics::is_wide(text[i]) || is_invisible(text[i]) || !metrics.wide(text[i], font).is_missing) continue;
      const bool is_pair = (text[i] & 0xFC00) == 0xD800 && i + 1 < text.size();
      missing.insert(text.substr(i, is_pair ? 2 : 1));
      if (is_pair) ++i;
    }
  };
  look_at(contents.header);
  look_at(contents.text);
  for (std::int32_t r = 0; contents.table && r < contents.table->Rows(); ++r) {
    for (std::int32_t c = 0; c < contents.table->Cols(); ++c) look_at(contents.table->cell_view(r, c));
  }
  return missing;
}

void warn_of(const std::set<Text>& missing) {
  constexpr std::size_t most_named = 20;
  if (missing.empty()) return;
  std::string words;
  std::size_t count = 0;
  for (const Text& character : missing) {
    if (++count <= most_named) words += " " + to_utf8(character);
  }
  warn(std::to_string(count) + " characters are in no font and are shown as boxes:" + words +
       (count > most_named ? " ..." : "") + "; --font-file names a TrueType font that has them");
}

/// The file of a font of this machine that may have some characters, from fontconfig; empty if it is not installed.
std::string matching_font(const std::set<Text>& characters) {
  constexpr std::size_t enough = 50;
  std::ostringstream command;
  command << "fc-match -f '%{file}' ':fontformat=TrueType:charset=" << std::hex;
  std::size_t count = 0;
  for (const Text& character : characters) {
    // The PDF library's fonts end at the basic plane.
    if (character.size() == 1 && ++count <= enough) command << ' ' << static_cast<unsigned>(character.front());
  }
  command << "' 2>/dev/null";
  if (count == 0) return {};
  const std::unique_ptr<FILE, int (*)(FILE*)> answer(popen(command.str().c_str(), "r"), &pclose);
  std::array<char, 4096> path{};
  if (!answer || fgets(path.data(), path.size(), answer.get()) == nullptr) return {};
  const std::string file = path.data();
  return file.ends_with(".ttf") ? file : std::string();
}

/// Finds a font for what the usual ones lack: the given one, or one of this machine.
void name_font(posix::PosixFontFiles& files, const ReportOptions& options, const Contents& contents) {
  std::string file = options.font_file;
  if (file.empty()) {
    FontMetrics metrics(files);
    const auto missing = missing_characters(contents, metrics, {family_of(font_name(options)), false, 8});
    if (!missing.empty()) file = matching_font(missing);
  }
  if (file.empty()) return;
  const std::string bytes = read_bytes(file);
  files.name_font({bytes.begin(), bytes.end()});
}

/// @param grid released before the report is written, which has a copy of its contents
void add_table(PrintControl& print, const Platform& platform, const ReportOptions& options,
               std::shared_ptr<Grid> grid) {
  if (grid->Rows() > 0) grid->put_FixedRows(1);
  const FontStyle font{family_of(print.FontName), false, 8};
  const std::int32_t room = print.PageWidth() - print.MarginLeft - print.MarginRight;
  const bool fits = lay_out(*grid, print.metrics(), font, room, platform.computer.locale());
  // Only pages with the other columns need to say whose they are.
  if (!fits) grid->put_FixedCols(std::min(options.keys, grid->Cols()));
  grid->WordWrap = Boolean(true);
  print.RenderObject = ObjectRef(std::move(grid));
  print.put_RenderControl(0);
}

std::string pdf_of(const ReportOptions& options) {
  if (!options.pdf.empty()) return options.pdf;
  if (options.file == "-") return "-";
  return std::filesystem::path(options.file).replace_extension(".pdf").string();
}

void require_other_file(const ReportOptions& options, const std::string& output) {
  std::error_code error;
  const bool is_same = output == options.file && output != "-";
  const bool is_regular = std::filesystem::is_regular_file(output, error);
  if (is_same || (is_regular && std::filesystem::equivalent(output, options.file, error))) {
    throw usage_failure(options.file + ": give --pdf another name");
  }
}

void use_fonts(PrintControl& print, const ReportOptions& options) {
  constexpr float title_points = 12;
  print.FontName = font_name(options);
  print.HeaderFontName = print.FontName;
  print.set_header_style(title_points, true);
}

void report(const ReportOptions& options) {
  posix::PosixPlatform posix_platform;
  posix_platform.files.allow_streams();
  const Platform platform = posix_platform.platform();
  const std::string output = pdf_of(options);
  require_other_file(options, output);
  const std::int32_t paper = paper_code(options.paper);
  Contents contents = read_contents(options, platform);
  name_font(posix_platform.font_files, options, contents);

  const auto print = std::make_shared<PrintControl>(platform);
  print->put_PaperSize(paper);
  print->put_Orientation(options.landscape ? 1 : 0);
  use_fonts(*print, options);
  print->Header = contents.header;
  print->StartDoc();
  const auto missing = missing_characters(contents, print->metrics(), {family_of(print->FontName), false, 8});
  on_file(shown_input(options.file), [&] {
    if (contents.table)
      add_table(*print, platform, options, std::exchange(contents.table, nullptr));
    else
      print->put_Text(std::exchange(contents.text, {}));
  });
  print->EndDoc();
  warn_of(missing);
  PdfExport pdf(platform);
  pdf.Author = utf8_text(options.author, "--author");
  pdf.Subject = utf8_text(options.subject, "--subject");
  on_file(shown_output(output), [&] { pdf.ConvertDocument(ObjectRef(print), output_path(output)); });
  const std::string pages = std::to_string(print->PageCount());
  if (options.json) {
    (output == "-" ? std::cerr : std::cout)
        << json::object({{"pages", pages}, {"output", json::text(std::string_view(output))}}) << '\n';
  } else {
    warn(shown_output(output) + ": " + pages + (print->PageCount() == 1 ? " page" : " pages"));
  }
}

}  // namespace

void add_report(CLI::App& app, Work& work) {
  const auto options = std::make_shared<ReportOptions>();
  auto* const command = app.add_subcommand("report", "Lay out a table or a text on pages and write them as PDF");
  command
      ->add_option("FILE", options->file,
                   "A comma-separated table (.csv, headings in the first line) or a text; - is "
                   "standard input")
      ->required();
  command->add_option("--as", options->kind, "table or text; default: by the file's extension");
  command->add_option("--title", options->title, "The header of every page; default: the file's name");
  command->add_option("--period", options->period, "A second line of the header: \"March 2009\"");
  command->add_option("--columns", options->columns, "The columns to show, by heading or number: Name,Amount")
      ->delimiter(',')
      ->allow_extra_args(false);
  command->add_option("--total", options->totals, "Columns of numbers whose totals end the table")
      ->delimiter(',')
      ->allow_extra_args(false);
  command
      ->add_option("--keys", options->keys,
                   "How many leading columns are repeated where columns continue on other pages")
      ->capture_default_str();
  command->add_option("--paper", options->paper, "A3, A4, A5, Letter, Legal or Tabloid")->capture_default_str();
  command->add_flag("--landscape", options->landscape, "Use landscape orientation");
  command->add_option("--font", options->font, "proportional, fixed or serif")->capture_default_str();
  command->add_option("--font-file", options->font_file,
                      "A TrueType font for characters that the others lack (Chinese, Japanese, Korean)");
  command->add_option("--author", options->author, "The author that the PDF names");
  command->add_option("--subject", options->subject, "The subject that the PDF names");
  command->add_option("--pdf", options->pdf, "The file to write; default: FILE with .pdf; - is standard output");
  add_encoding(*command, options->encoding.name);
  add_json(*command, options->json, "Print the number of pages as JSON");
  choose(*command, work, options, &report);
}

}  // namespace talutil::cli
