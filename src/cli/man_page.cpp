#include <CLI/CLI.hpp>
#include <iostream>
#include <sstream>

#include "cli/classes.hpp"
#include "cli/commands.hpp"
#include "library/version.hpp"

namespace talutil::cli {

namespace {

/// Text of a manual page: a dash stays a dash, and nothing is taken for a request.
std::string roff(std::string_view text) {
  std::string result;
  for (const char c : text) {
    const bool begins_line = result.empty() || result.back() == '\n';
    if (begins_line && (c == '.' || c == '\'')) result += "\\&";
    if (c == '\\')
      result += "\\e";
    else if (c == '-')
      result += "\\-";
    else
      result += c;
  }
  return result;
}

/// A term with the text that explains it.
void print_item(std::string_view term, std::string_view text) {
  std::cout << ".TP\n.B " << roff(term) << '\n' << roff(text.empty() ? " " : text) << '\n';
}

void print_option(const CLI::Option& option) {
  std::string term = option.get_positional() ? option.get_name(true) : option.get_name(false, true);
  for (auto comma = term.find(','); comma != std::string::npos; comma = term.find(',', comma + 2)) {
    term.insert(comma + 1, " ");
  }
  if (!option.get_positional() && option.get_type_size() != 0) {
    term += option.get_type_name().empty() ? "" : " " + option.get_type_name();
  }
  std::string text = option.get_description();
  if (const std::string usual = option.get_default_str(); !usual.empty()) text += " (" + usual + ")";
  print_item(term, text);
}

/// A subcommand with its options and what stands below its help, then its own subcommands.
void print_command(const CLI::App& command, const std::string& before) {
  const std::string name = before + command.get_name();
  std::cout << ".SS " << roff(name) << '\n'
            << roff(command.get_description()) << (command.get_description().ends_with('.') ? "\n" : ".\n");
  for (const CLI::Option* const option : command.get_options()) {
    if (option != command.get_help_ptr()) print_option(*option);
  }
  // A subcommand without a footer inherits that of the command.
  if (!command.get_footer().empty() && command.get_footer() != command.get_parent()->get_footer())
    std::cout << ".PP\n.nf\n" << roff(command.get_footer()) << "\n.fi\n";
  for (const CLI::App* const part : command.get_subcommands({})) print_command(*part, name + " ");
}

void print_members(const PublishedClass& owner) {
  std::cout << ".SH " << roff(owner.name()) << '\n' << roff(owner.text->text.summary) << '\n';
  for (const std::string_view family : texts::families()) {
    const auto entries = family_of(owner, family);
    if (entries.empty()) continue;
    std::cout << ".SS " << roff(family_title(family)) << '\n';
    for (const Entry& entry : entries) print_item(signature(entry), owner.text_of(entry).summary);
  }
}

}  // namespace

void man_page(const CLI::App& app) {
  std::cout << ".\\\" Printed by talutil help --man.\n.TH TALUTIL 1 \"\" \"TALUtil " << version_text
            << "\" \"User Commands\"\n.nh\n.ad l\n.SH NAME\ntalutil \\- the members of TALUtil on the command line\n"
               ".SH SYNOPSIS\n.B talutil\n.I SUBCOMMAND\n.RI [ ARGUMENT ]...\n.SH DESCRIPTION\n"
            << roff(app.get_description()) << "\n.PP\n.nf\n"
            << roff(app.get_footer()) << "\n.fi\n.SH SUBCOMMANDS\n";
  for (const CLI::App* const command : app.get_subcommands({})) print_command(*command, "");
  for (const PublishedClass& owner : published_classes()) print_members(owner);
}

}  // namespace talutil::cli
