#include <iostream>

#include "cli/classes.hpp"
#include "cli/commands.hpp"
#include "cli/json.hpp"

namespace talutil::cli {

namespace {

using texts::MemberText;

/// Text of a Markdown page.
std::string plain(std::string_view text) {
  constexpr std::string_view special = "|*_<`\\[";
  std::string result;
  for (const char c : text) {
    if (special.find(c) != std::string_view::npos) result += '\\';
    result += c;
  }
  return result;
}

std::string code(std::string_view text) { return "`" + std::string(text) + "`"; }

/// A link to the heading of a member or class, or to another page of docs.
std::string link(std::string_view target) {
  constexpr std::string_view folder = "docs/";
  if (target.starts_with(folder)) {
    const std::string page(target.substr(folder.size()));
    return "[" + page + "](" + page + ")";
  }
  std::string anchor;
  for (const char c : target) {
    if (c != '.') anchor += fold_case(c);
  }
  return "[" + code(target) + "](#" + anchor + ")";
}

void print_parameters(const Entry& entry, const MemberText& text) {
  const auto parameters = parameters_of(entry);
  if (parameters.empty()) return;
  std::cout << "\n| Argument | Type | Meaning |\n|---|---|---|\n";
  for (std::size_t i = 0; i < parameters.size(); ++i) {
    const Parameter& parameter = parameters[i];
    std::string meaning = i < text.parameters.size() ? plain(text.parameters[i].text) : std::string();
    if (parameter.is_optional) meaning += " If left out, " + code(default_words(parameter)) + ".";
    std::cout << "| " << code(parameter.name) << " | " << type_name(parameter.type)
              << (parameter.passing == Passing::written_back ? ", written back" : "") << " | " << meaning << " |\n";
  }
}

void print_names(std::string_view words, std::span<const std::string_view> names) {
  if (names.empty()) return;
  std::cout << '\n' << words << ' ';
  std::string_view separator;
  for (const std::string_view name : names) {
    std::cout << separator << link(name);
    separator = ", ";
  }
  std::cout << ".\n";
}

void print_member(const PublishedClass& owner, const Entry& entry) {
  const MemberText& text = owner.text_of(entry);
  std::cout << "\n#### " << owner.full_name(entry) << "\n\n" << code(signature(entry));
  if (!entry.is_method()) std::cout << " (" << access_words(entry) << ")";
  std::cout << "\n\n" << plain(text.summary);
  if (!text.details.empty()) std::cout << (text.details.starts_with('\n') ? "" : " ") << plain(text.details);
  std::cout << '\n';
  print_parameters(entry, text);
  if (!text.errors.empty()) std::cout << '\n';
  for (const texts::RaisedError& error : text.errors) {
    std::cout << "- Error " << error.number << ' ' << plain(error.when) << '\n';
  }
  print_names("Reads", text.reads);
  print_names("Changes", text.changes);
  for (const texts::Example& example : text.examples) {
    std::cout << '\n' << (example.title.empty() ? "" : plain(example.title) + ":\n\n") << "```vb\n";
    std::cout << example.code << "\n```\n";
  }
  print_names("See also", text.see);
}

void print_class(const PublishedClass& owner) {
  const MemberText& text = owner.text->text;
  std::cout << "\n## " << owner.name() << "\n\n" << plain(text.summary);
  if (!text.details.empty()) std::cout << (text.details.starts_with('\n') ? "" : " ") << plain(text.details);
  std::cout << "\n\nProgrammatic identifier: " << code(owner.program_id) << ".\n";
  for (const texts::Example& example : text.examples) std::cout << "\n```vb\n" << example.code << "\n```\n";
  for (const std::string_view family : texts::families()) {
    const auto entries = family_of(owner, family);
    if (entries.empty()) continue;
    std::cout << "\n### " << owner.name() << ": " << family << '\n';
    for (const Entry& entry : entries) print_member(owner, entry);
  }
}

void print_contents(const std::vector<PublishedClass>& classes) {
  std::cout << "\n| Class | Family | Members |\n|---|---|---|\n";
  for (const PublishedClass& owner : classes) {
    for (const std::string_view family : texts::families()) {
      const auto entries = family_of(owner, family);
      if (entries.empty()) continue;
      std::cout << "| " << link(owner.name()) << " | " << family << " |";
      for (const Entry& entry : entries) std::cout << ' ' << link(owner.full_name(entry));
      std::cout << " |\n";
    }
  }
}

}  // namespace

void reference() {
  const auto classes = published_classes();
  std::cout
      << "# Reference\n\n"
         "Printed by `talutil reference` from the doc comments of the sources: change it there.\n\n"
         "All objects of a loaded library share the settings of ORVUtils. Optional arguments stand in brackets\n"
         "with their defaults; `ByRef` marks what is written back. In the examples, `u` is a `TALUtil.ORVUtils`\n"
         "and `folder` the path of an empty folder; `Print` stands for the host's output, and the comments below\n"
         "it are what it prints.\n";
  print_contents(classes);
  for (const PublishedClass& owner : classes) print_class(owner);
}

}  // namespace talutil::cli
