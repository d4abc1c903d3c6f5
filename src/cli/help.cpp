#include <algorithm>
#include <iostream>

#include "cli/arguments.hpp"
#include "cli/classes.hpp"
#include "cli/commands.hpp"
#include "cli/wrapping.hpp"

namespace talutil::cli {

namespace {

using texts::ClassText;
using texts::MemberText;

constexpr std::size_t margin = 2;

/// For example "Long, written -2147483648 to 2147483647; written back".
std::string argument_words(const Parameter& parameter) {
  std::string words(type_name(parameter.type));
  if (const auto how = how_to_write(parameter.type); !how.empty() && parameter.type != ValueType::text) {
    words += ", written ";
    words += how;
  }
  if (parameter.passing == Passing::written_back) words += "; written back";
  if (parameter.is_optional) words += "; " + default_words(parameter) + " when left out";
  return words;
}

void print_heading(std::string_view heading) { std::cout << '\n' << heading << '\n'; }

/// A list of names with texts behind them, which are aligned.
void print_named(const std::vector<std::pair<std::string, std::string>>& rows) {
  std::size_t column = 0;
  for (const auto& [name, text] : rows) column = std::max(column, name.size());
  column += 2 * margin;
  for (const auto& [name, text] : rows) {
    std::string first = std::string(margin, ' ') + name;
    first.resize(column, ' ');
    std::cout << wrapped(text, output_width(), column, first);
  }
}

void print_arguments(const Entry& entry, const MemberText& text) {
  std::vector<std::pair<std::string, std::string>> rows;
  const auto parameters = parameters_of(entry);
  for (std::size_t i = 0; i < parameters.size(); ++i) {
    std::string words = i < text.parameters.size() ? std::string(text.parameters[i].text) + " " : std::string();
    words += "(" + argument_words(parameters[i]) + ")";
    rows.emplace_back(parameters[i].name, words);
  }
  if (rows.empty()) return;
  print_heading("Arguments");
  print_named(rows);
}

void print_errors(const MemberText& text) {
  if (text.errors.empty()) return;
  print_heading("Errors");
  std::vector<std::pair<std::string, std::string>> rows;
  for (const texts::RaisedError& error : text.errors) rows.emplace_back(std::to_string(error.number), error.when);
  print_named(rows);
}

std::string joined(std::span<const std::string_view> names) {
  std::string words;
  for (const std::string_view name : names) words += (words.empty() ? "" : ", ") + std::string(name);
  return words;
}

void print_settings(const MemberText& text) {
  if (!text.reads.empty())
    print_heading("Settings read"), std::cout << wrapped(joined(text.reads), output_width(), margin);
  if (!text.changes.empty()) {
    print_heading("Settings changed");
    std::cout << wrapped(joined(text.changes), output_width(), margin);
  }
}

void print_examples(const MemberText& text) {
  for (const texts::Example& example : text.examples) {
    print_heading(example.title.empty() ? "Example" : "Example: " + std::string(example.title));
    std::cout << indented(example.code, margin);
  }
}

void print_see(const MemberText& text) {
  if (text.see.empty()) return;
  print_heading("See also");
  std::cout << wrapped(joined(text.see), output_width(), margin);
}

void print_usage(const Entry& entry) {
  std::string usage = "talutil call ";
  usage += entry.any().name;
  if (entry.is_method()) {
    for (const Parameter& parameter : entry.call->parameters()) {
      const std::string name(parameter.name);
      usage += ' ' + (parameter.is_optional ? "[" + name + "]" : name);
    }
  } else if (entry.put != nullptr) {
    usage += entry.get != nullptr ? " [value]" : " value";
  }
  print_heading("On the command line");
  std::cout << wrapped(usage, output_width(), margin + margin, std::string(margin, ' '));
}

void print_description(const MemberText& text) {
  std::string description(text.summary);
  if (!text.details.empty()) description += (text.details.starts_with('\n') ? "" : " ") + std::string(text.details);
  std::cout << '\n' << wrapped(description, output_width(), margin);
}

void print_member(const PublishedClass& owner, const Entry& entry) {
  const MemberText& text = owner.text_of(entry);
  const bool is_toolkit = owner.full_name(entry) == entry.any().name;
  std::cout << (is_toolkit ? "" : std::string(owner.name()) + ".") << signature(entry) << '\n';
  print_description(text);
  if (!entry.is_method()) {
    std::cout << '\n'
              << wrapped(is_toolkit ? "A setting (" + access_words(entry) + "), shared by all objects of the library."
                                    : "A property (" + access_words(entry) + ").",
                         output_width(), margin);
  }
  print_arguments(entry, text);
  print_errors(text);
  print_settings(text);
  print_examples(text);
  print_see(text);
  if (is_toolkit) print_usage(entry);
}

void print_class(const PublishedClass& owner) {
  std::cout << owner.name() << '\n';
  print_description(owner.text->text);
  std::cout << '\n'
            << wrapped("Created by CreateObject(\"" + std::string(owner.program_id) + "\").", output_width(), margin);
  print_examples(owner.text->text);
  for (const std::string_view family : texts::families()) {
    std::vector<std::pair<std::string, std::string>> rows;
    for (const Entry& entry : family_of(owner, family)) {
      rows.emplace_back(entry.any().name, owner.text_of(entry).summary);
    }
    if (rows.empty()) continue;
    print_heading(family_title(family));
    print_named(rows);
  }
}

}  // namespace

void help(const std::string& name) {
  const Subject subject = find_subject(name);
  if (subject.member)
    print_member(subject.owner, *subject.member);
  else
    print_class(subject.owner);
}

}  // namespace talutil::cli
