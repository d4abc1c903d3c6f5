#include "cli/help_command.hpp"

#include <iostream>

#include "cli/failure.hpp"
#include "cli/help_json.hpp"
#include "cli/help_text.hpp"
#include "cli/near_names.hpp"
#include "cli/options.hpp"

namespace talutil::cli {

namespace {

struct HelpOptions {
  std::vector<std::string> words;
  bool is_manual_page = false;
  bool is_json = false;
};

const CLI::App* subcommand(const CLI::App& app, std::string_view name) {
  for (const CLI::App* const each : app.get_subcommands([](const CLI::App*) { return true; })) {
    if (each->get_name() == name) return each;
  }
  return nullptr;
}

std::string help_of(const CLI::App& app, const std::string& name) {
  return app.get_formatter()->make_help(&app, name, CLI::AppFormatMode::Normal);
}

/// Only classes and members are described in a form for programs.
void print_json(const CLI::App& app, const std::vector<std::string>& words) {
  const std::string name = words.empty() ? std::string() : words.front();
  if (subcommand(app, name) != nullptr || !help_topic(name).empty() || words.size() > 1) {
    throw usage_failure("help --json describes classes and members; \"talutil help " + name + "\" explains " + name);
  }
  help_json(name);
}

void print_help(const CLI::App& app, const HelpOptions& options) {
  if (options.is_manual_page) return man_page(app);
  if (options.is_json) return print_json(app, options.words);
  const CLI::App* command = &app;
  std::string name = app.get_name();
  for (const std::string& word : options.words) {
    const CLI::App* const below = subcommand(*command, word);
    if (below == nullptr && command != &app) {
      check_subcommand(*command, word);
    } else if (below == nullptr) {
      if (const auto topic = help_topic(word); !topic.empty())
        std::cout << topic;
      else
        help(word);
      return;
    }
    command = below;
    name += " " + word;
  }
  std::cout << help_of(*command, name);
}

}  // namespace

void check_subcommand(const CLI::App& app, std::string_view word) {
  std::vector<std::string_view> names;
  std::string all;
  const auto commands = app.get_subcommands([](const CLI::App*) { return true; });
  std::vector<std::string> held;
  held.reserve(commands.size());
  for (const CLI::App* const command : commands) {
    if (command->get_name() == word) return;
    names.push_back(held.emplace_back(command->get_name()));
    all += (all.empty() ? "" : ", ") + held.back();
  }
  const auto nearest = nearest_names(names, word);
  const std::string hint = nearest.empty() ? "there are " + all : did_you_mean(nearest);
  throw usage_failure("there is no subcommand \"" + std::string(word) + "\"; " + hint);
}

std::string help_hint(const CLI::App& app) {
  std::string name = app.get_name();
  for (const CLI::App* command = &app; !command->get_subcommands().empty();) {
    command = command->get_subcommands().front();
    name += " " + command->get_name();
  }
  return "\"" + name + " --help\"";
}

void add_help(CLI::App& app, Work& work) {
  const auto options = std::make_shared<HelpOptions>();
  auto* const command = app.add_subcommand("help", "Explain a class, a member, a subcommand or a topic");
  command->add_option("NAME", options->words,
                      "A class or a member in any case, a subcommand, or one of: " + help_topics());
  auto* const manual = command->add_flag("--man", options->is_manual_page, "Print the manual page, talutil.1");
  add_json(*command, options->is_json, "Print the class or the member, or every member, one object a line, as JSON");
  command->get_option("--json")->excludes(manual);
  choose(*command, work, options, [&app](const HelpOptions& chosen) { print_help(app, chosen); });
}

}  // namespace talutil::cli
