#include <algorithm>
#include <iostream>

#include "automation/member_table.hpp"
#include "cli/batch.hpp"
#include "cli/failure.hpp"
#include "cli/options.hpp"
#include "library/cpp_header.hpp"
#include "library/interface_definition.hpp"
#include "library/version.hpp"

namespace {

using namespace talutil::cli;

void add_printers(CLI::App& app, Work& work) {
  const auto nothing = std::make_shared<int>();
  choose(*app.add_subcommand("idl", "Print the interface definition of the type library"), work, nothing,
         [](int) { std::cout << talutil::interface_definition(); });
  choose(*app.add_subcommand("header", "Print talutil.h, with which C++ programs are bound early"), work, nothing,
         [](int) { std::cout << talutil::cpp_header(); });
  const auto is_json = std::make_shared<bool>(false);
  auto* const printing = app.add_subcommand("reference", "Print the reference of all classes, in Markdown");
  printing->add_flag("--json", *is_json, "Print it as JSON, for programs");
  choose(*printing, work, is_json, [](bool json) { json ? reference_json() : reference(); });
}

struct HelpOptions {
  std::string name;
  bool is_manual_page = false;
};

void add_help(CLI::App& app, Work& work) {
  const auto options = std::make_shared<HelpOptions>();
  auto* const command = app.add_subcommand("help", "Explain a class, a member, or this command");
  command->add_option("MEMBER", options->name, "A class, a member or Class.Member, in any case");
  command->add_flag("--man", options->is_manual_page, "Print the manual page, talutil.1");
  choose(*command, work, options, [&app](const HelpOptions& chosen) {
    if (chosen.is_manual_page)
      man_page(app);
    else if (chosen.name.empty())
      std::cout << app.help();
    else
      help(chosen.name);
  });
}

/// Fails if the first word is not a subcommand; lists the subcommands.
void check_subcommand(const CLI::App& app, std::string_view word) {
  std::string names;
  for (const CLI::App* const command : app.get_subcommands({})) {
    if (command->get_name() == word) return;
    names += (names.empty() ? "" : ", ") + command->get_name();
  }
  throw usage_failure("there is no subcommand \"" + std::string(word) + "\"; there are " + names);
}

/// Removes what follows "--" from the command line: arguments of a call that must not be interpreted.
std::vector<std::string> take_verbatim(std::vector<std::string>& words) {
  const auto mark = std::ranges::find(words, "--");
  if (mark == words.end()) return {};
  std::vector<std::string> verbatim(mark + 1, words.end());
  words.erase(mark, words.end());
  return verbatim;
}

int run(std::vector<std::string> words) {
  CLI::App app("TALUtil on the command line: its members listed, explained and called.", "talutil");
  app.set_version_flag("--version", talutil::version_text);
  app.require_subcommand(1);
  app.footer(
      "\"talutil help MEMBER\" explains a member, \"talutil call --help\" how arguments are written.\n"
      "TALUTIL_CODE_PAGE sets the ANSI code page used to compare characters (1251, 932, 65001 ...); default: 1252.");
  Work work;
  std::vector<std::string> verbatim;
  add_list(app, work);
  add_help(app, work);
  add_call(app, work, verbatim);
  add_batch(app, work);
  add_clean(app, work);
  add_secrets(app, work);
  add_config(app, work);
  add_archives(app, work);
  add_export(app, work);
  add_report(app, work);
  add_log(app, work);
  add_system(app, work);
  add_printers(app, work);
  if (!words.empty() && !words.front().starts_with('-')) check_subcommand(app, words.front());
  if (!words.empty() && words.front() == "call") verbatim = take_verbatim(words);
  std::ranges::reverse(words);  // the parser takes them from the back
  try {
    app.parse(words);
  } catch (const CLI::Success& help_or_version) {
    return app.exit(help_or_version);
  } catch (const CLI::ParseError& error) {
    std::string message = error.what();
    // Keep a name in capitals, such as that of a missing argument.
    const bool is_name = message.size() > 1 && talutil::fold_case(message[1]) != message[1];
    if (!is_name) message.front() = talutil::fold_case(message.front());
    throw usage_failure(message + "; see \"talutil --help\"");
  }
  const int status = work();
  if (!std::cout.flush()) throw run_time_failure("cannot write the output");
  return status;
}

}  // namespace

int main(int argc, char** argv) {
  try {
    return run({argv + 1, argv + argc});
  } catch (const Failure& failure) {
    std::cerr << "talutil: " << failure.what() << '\n';
    return failure.status();
  } catch (const talutil::RunTimeError& error) {
    std::cerr << "talutil: " << error_words(error) << '\n';
  } catch (const std::exception& error) {
    std::cerr << "talutil: " << error.what() << '\n';
  }
  return run_time_status;
}
