#include "cli/completion.hpp"

#include <functional>
#include <iostream>

#include "cli/entries.hpp"
#include "cli/failure.hpp"
#include "cli/options.hpp"
#include "cli/session.hpp"

namespace talutil::cli {

namespace {

struct CompletionOptions {
  std::string shell;
};

/// A subcommand, or one below it, as it is typed: "config get".
struct Command {
  std::string words;
  std::string help;
  std::vector<const CLI::Option*> options;
  std::vector<std::string> below;
  bool takes_members = false;
};

std::vector<const CLI::Option*> options_of(const CLI::App& app) {
  return app.get_options([](const CLI::Option* option) { return option->nonpositional(); });
}

void collect(const CLI::App& app, const std::string& words, std::vector<Command>& commands) {
  Command command{words, app.get_description(), options_of(app), {}, words == "call" || words == "help"};
  const auto below = app.get_subcommands([](const CLI::App*) { return true; });
  for (const CLI::App* const each : below) command.below.push_back(each->get_name());
  commands.push_back(std::move(command));
  for (const CLI::App* const each : below) {
    collect(*each, words.empty() ? each->get_name() : words + " " + each->get_name(), commands);
  }
}

std::string joined(const std::vector<std::string>& words) {
  std::string line;
  for (const std::string& word : words) line += (line.empty() ? "" : " ") + word;
  return line;
}

std::string members() {
  std::vector<std::string> names;
  for (const Entry& entry : entries_of(Session::members().members)) names.emplace_back(entry.any().name);
  return joined(names);
}

std::string option_words(const Command& command) {
  std::vector<std::string> words;
  for (const CLI::Option* const option : command.options) {
    for (const std::string& name : option->get_snames()) words.push_back("-" + name);
    for (const std::string& name : option->get_lnames()) words.push_back("--" + name);
  }
  return joined(words);
}

/// The cases of a shell's `case` by the words of the subcommand, for bash and zsh.
void print_cases(const std::vector<Command>& commands) {
  for (const Command& command : commands) {
    std::cout << "    '" << command.words << "') options='" << option_words(command) << "' below='"
              << joined(command.below) << (command.takes_members ? " '\"$members\"" : "'") << " ;;\n";
  }
}

/// The first words of the line that are subcommands are the key of the cases.
void print_bash(const std::vector<Command>& commands) {
  std::cout << "# Completion of talutil for bash: . <(talutil completion bash)\n"
               "_talutil() {\n"
               "  local members='"
            << members()
            << "'\n"
               "  local current=${COMP_WORDS[COMP_CWORD]} key= options= below= i\n"
               "  for ((i = 1; i < COMP_CWORD && i < 3; i++)); do\n"
               "    [[ ${COMP_WORDS[i]} == -* ]] && break\n"
               "    case \"${key:+$key }${COMP_WORDS[i]}\" in\n      ";
  std::string_view separator;
  for (const Command& command : commands) {
    if (command.words.empty()) continue;
    std::cout << separator << "'" << command.words << "'";
    separator = " | ";
  }
  std::cout << ") key=${key:+$key }${COMP_WORDS[i]} ;;\n"
               "      *) break ;;\n"
               "    esac\n"
               "  done\n"
               "  case $key in\n";
  print_cases(commands);
  std::cout << "  esac\n"
               "  [[ $current == -* ]] && below=$options\n"
               "  COMPREPLY=($(compgen -W \"$below\" -- \"$current\"))\n"
               "}\n"
               "complete -o default -F _talutil talutil\n";
}

void print_zsh(const std::vector<Command>& commands) {
  std::cout << "#compdef talutil\n"
               "# Completion of talutil for zsh: talutil completion zsh >FOLDER-IN-FPATH/_talutil\n"
               "_talutil() {\n"
               "  local members='"
            << members()
            << "'\n"
               "  local key= options= below= each\n"
               "  local -a reply_words\n"
               "  for each in ${words[2,CURRENT-1]}; do\n"
               "    case \"${key:+$key }$each\" in\n      ";
  std::string_view separator;
  for (const Command& command : commands) {
    if (command.words.empty()) continue;
    std::cout << separator << "'" << command.words << "'";
    separator = " | ";
  }
  std::cout << ") key=${key:+$key }$each ;;\n"
               "      *) break ;;\n"
               "    esac\n"
               "  done\n"
               "  local current=$words[CURRENT]\n"
               "  case $key in\n";
  print_cases(commands);
  std::cout << "  esac\n"
               "  [[ $current == -* ]] && below=$options\n"
               "  reply_words=(${=below})\n"
               "  (( $#reply_words )) && compadd -- $reply_words\n"
               "  [[ $current == -* ]] || _files\n"
               "}\n"
               "if [ \"$funcstack[1]\" = _talutil ]; then _talutil \"$@\"; else compdef _talutil talutil; fi\n";
}

std::string in_quotes(std::string_view text) {
  std::string result = "'";
  for (const char c : text) result += c == '\'' ? std::string("\\'") : std::string(1, c);
  return result + "'";
}

/// One candidate of fish: a subcommand with its help.
void print_fish_subcommand(const std::string& condition, const Command& command) {
  std::cout << "complete -c talutil -n " << condition << " -f -a " << command.words.substr(command.words.rfind(' ') + 1)
            << " -d " << in_quotes(command.help) << '\n';
}

void print_fish_option(const std::string& condition, const CLI::Option& option) {
  std::cout << "complete -c talutil -n " << condition;
  for (const std::string& name : option.get_snames()) std::cout << " -s " << name;
  for (const std::string& name : option.get_lnames()) std::cout << " -l " << name;
  if (option.get_items_expected_max() > 0) std::cout << " -r";  // A value follows.
  std::cout << " -d " << in_quotes(option.get_description()) << '\n';
}

void print_fish(const std::vector<Command>& commands) {
  std::cout << "# Completion of talutil for fish: talutil completion fish | source\n";
  for (const Command& command : commands) {
    if (command.words.empty()) continue;
    const std::size_t blank = command.words.find(' ');
    const std::string parent = command.words.substr(0, blank);
    std::string condition = "'__fish_seen_subcommand_from " + parent;
    if (blank == std::string::npos) {
      print_fish_subcommand("__fish_use_subcommand", command);
    } else {
      print_fish_subcommand(condition + "'", command);
      condition += "; and __fish_seen_subcommand_from " + command.words.substr(blank + 1);
    }
    condition += '\'';
    if (command.takes_members) std::cout << "complete -c talutil -n " << condition << " -a '" << members() << "'\n";
    for (const CLI::Option* const option : command.options) print_fish_option(condition, *option);
  }
}

void print_completion(const CLI::App& app, const std::string& shell) {
  std::vector<Command> commands;
  collect(app, "", commands);
  if (shell == "bash") return print_bash(commands);
  if (shell == "zsh") return print_zsh(commands);
  if (shell == "fish") return print_fish(commands);
  throw usage_failure("completion: there is none for \"" + shell + "\"; there are bash, zsh and fish");
}

}  // namespace

void add_completion(CLI::App& app, Work& work) {
  const auto options = std::make_shared<CompletionOptions>();
  auto* const command = app.add_subcommand("completion", "Print a script with which a shell completes this command");
  command->add_option("SHELL", options->shell, "bash, zsh or fish")->required();
  command->footer("  . <(talutil completion bash)");
  choose(*command, work, options, [&app](const CompletionOptions& chosen) { print_completion(app, chosen.shell); });
}

}  // namespace talutil::cli
