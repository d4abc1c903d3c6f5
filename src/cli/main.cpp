#include <algorithm>
#include <iostream>

#include "automation/member_table.hpp"
#include "cli/batch.hpp"
#include "cli/completion.hpp"
#include "cli/failure.hpp"
#include "cli/help_command.hpp"
#include "cli/help_text.hpp"
#include "cli/interruption.hpp"
#include "cli/json.hpp"
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

/// Removes what follows "--" from the command line: arguments of a call that must not be interpreted.
std::vector<std::string> take_verbatim(std::vector<std::string>& words) {
  const auto mark = std::ranges::find(words, "--");
  if (mark == words.end()) return {};
  std::vector<std::string> verbatim(mark + 1, words.end());
  words.erase(mark, words.end());
  return verbatim;
}

void add_all(CLI::App& app, Work& work, const std::vector<std::string>& verbatim) {
  app.set_version_flag("-V,--version", talutil::version_text);
  app.require_subcommand(1);
  app.formatter(std::make_shared<HelpFormatter>());
  app.footer("\"talutil help NAME\" explains a member, a subcommand, or one of: " + help_topics() +
             ".\n\"talutil call --help\" shows how arguments are written.");
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
  add_completion(app, work);
}

/// Fails if the first words are not subcommands.
void check_subcommands(const CLI::App& app, const std::vector<std::string>& words) {
  const CLI::App* command = &app;
  for (const std::string& word : words) {
    if (word.starts_with('-') || command->get_subcommands([](const CLI::App*) { return true; }).empty()) return;
    check_subcommand(*command, word);
    command = command->get_subcommand(word);
  }
}

/// Help is asked for: that of a member, for "call GetData --help", otherwise of the subcommand.
int show_help(const CLI::App& app, const CLI::Success& request) {
  const CLI::App* const call = app.get_subcommand("call");
  const CLI::Option* const member = call->get_option("MEMBER");
  if (!call->parsed() || member->count() == 0) return app.exit(request);
  help(member->results().front());
  return 0;
}

int run(std::vector<std::string> words) {
  CLI::App app("TALUtil on the command line: its members listed, explained and called.", "talutil");
  Work work;
  std::vector<std::string> verbatim;
  add_all(app, work, verbatim);
  check_subcommands(app, words);
  if (!words.empty() && words.front() == "call") verbatim = take_verbatim(words);
  std::ranges::reverse(words);  // the parser takes them from the back
  try {
    app.parse(words);
  } catch (const CLI::CallForHelp& request) {
    return show_help(app, request);
  } catch (const CLI::Success& version) {
    return app.exit(version);
  } catch (const CLI::ParseError& error) {
    std::string message = error.what();
    // Keep a name in capitals, such as that of a missing argument.
    const bool is_name = message.size() > 1 && talutil::fold_case(message[1]) != message[1];
    if (!is_name) message.front() = talutil::fold_case(message.front());
    throw usage_failure(message + "; see " + help_hint(app));
  }
  const int status = work();
  if (!std::cout.flush()) throw run_time_failure("cannot write the output");
  return status;
}

/// Whether the answer, and therefore an error, is wanted as JSON. Asked of the words themselves, because it must be
/// known even if they cannot be parsed.
bool wants_json(const std::vector<std::string>& words) {
  return std::find(words.begin(), std::ranges::find(words, "--"), "--json") != std::ranges::find(words, "--");
}

int report_failure(const std::vector<std::string>& words, const Failure& failure) {
  if (!wants_json(words)) {
    std::cerr << "talutil: " << failure.what() << '\n';
    return failure.status();
  }
  std::vector<json::Field> fields{{"status", std::to_string(failure.status())},
                                  {"message", json::text(std::string_view(failure.what()))}};
  if (failure.number() != 0) fields.emplace_back("number", std::to_string(failure.number()));
  std::cerr << json::object({{"error", json::object(fields)}}) << '\n';
  return failure.status();
}

}  // namespace

int main(int argc, char** argv) {
  const std::vector<std::string> words(argv + 1, argv + argc);
  const Interruption interruption;
  try {
    return run(words);
  } catch (const Failure& failure) {
    return report_failure(words, failure);
  } catch (const talutil::RunTimeError& error) {
    return report_failure(words, {run_time_status, error_words(error), error.number()});
  } catch (const std::exception& error) {
    return report_failure(words, run_time_failure(error.what()));
  }
}
