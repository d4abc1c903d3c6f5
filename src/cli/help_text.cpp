#include "cli/help_text.hpp"

#include <algorithm>
#include <iterator>

#include "cli/wrapping.hpp"

namespace talutil::cli {

namespace {

struct Topic {
  std::string_view name;
  std::string_view text;
};

constexpr Topic topics[] = {
    {"exit-codes",
     "Exit codes\n\n"
     "  0    done\n"
     "  1    failed: not done as asked\n"
     "  2    wrong use: an option, an argument or a name\n"
     "  3    the answer is False, with \"talutil call --test\"\n"
     "  4    done, except for what is named on standard error\n"
     "  130  interrupted by Ctrl-C (143 by SIGTERM); temporary files are removed\n"},
    {"encodings",
     "Encodings of files\n\n"
     "An input is read by its byte order mark; without one as UTF-8 if it is that, otherwise in the code page "
     "(--code-page, TALUTIL_CODE_PAGE, 1252), which is said on standard error. --encoding names it instead: utf-8, "
     "utf-16 or the number of a code page. SQL, CSV and JSON lines are written in UTF-8, or as --output-encoding "
     "says.\n"
     "\"-\" is standard input or output wherever a file is named.\n"},
    {"environment",
     "Environment variables\n\n"
     "  TALUTIL_CODE_PAGE  the ANSI code page that members compare characters by; 1252 without it\n"
     "  TALUTIL_DRIVES     the folder that holds the drives: C: is its folder c, Z: is /\n"
     "  TALUTIL_HIVE       the file of the user's settings\n"
     "  TALUTIL_DATABASE   what config uses without --database\n"
     "  TALUTIL_USER       what config uses without --user\n"
     "  LC_NUMERIC         the separators in numbers as text (LC_ALL, LANG)\n"
     "  COLUMNS            the width of help\n"
     "  TERM               \"dumb\" shows no progress\n"},
};

/// Where the lines that continue a line begin: below the description of an option, otherwise as the line itself.
std::size_t indent_of(std::string_view line) {
  constexpr std::size_t description = 30;
  const bool is_described =
      line.starts_with("  ") && line.size() > description && line[description - 1] == ' ' && line[description] != ' ';
  if (is_described) return description;
  return std::min(line.find_first_not_of(' '), line.size());
}

std::string wrapped(std::string_view text, std::size_t width) {
  std::string result;
  while (!text.empty()) {
    std::string_view line = text.substr(0, text.find('\n'));
    const bool has_end = line.size() < text.size();
    text.remove_prefix(line.size() + (has_end ? 1 : 0));
    const std::string indent(indent_of(line), ' ');
    std::size_t room = width;
    while (line.size() > room) {
      std::size_t blank = line.rfind(' ', room);
      // A word that is longer than the line stays whole.
      if (blank == std::string_view::npos || line.find_first_not_of(' ') > blank) blank = line.find(' ', room);
      if (blank == std::string_view::npos) break;
      result += line.substr(0, blank);
      result += '\n';
      line.remove_prefix(std::min(line.find_first_not_of(' ', blank), line.size()));
      result += indent;
      room = width - indent.size();
    }
    result += line;
    if (has_end) result += '\n';
  }
  return result;
}

}  // namespace

std::string HelpFormatter::make_help(const CLI::App* app, std::string name, CLI::AppFormatMode mode) const {
  return wrapped(Formatter::make_help(app, std::move(name), mode), output_width());
}

std::string help_topic(std::string_view name) {
  const auto* const found = std::ranges::find(topics, name, &Topic::name);
  return found == std::end(topics) ? std::string() : wrapped(found->text, output_width());
}

std::string help_topics() {
  std::string names;
  for (const Topic& topic : topics) names += (names.empty() ? "" : ", ") + std::string(topic.name);
  return names;
}

}  // namespace talutil::cli
