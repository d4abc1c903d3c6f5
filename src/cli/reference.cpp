#include <iostream>

#include "cli/commands.hpp"
#include "cli/entries.hpp"
#include "cli/session.hpp"
#include "library/c_control_position.hpp"

namespace talutil::cli {

namespace {

/// A cell of a Markdown table.
std::string cell(std::string_view text) {
  std::string result;
  for (const char c : text) {
    if (c == '|' || c == '*' || c == '_' || c == '<') result += '\\';
    result += c;
  }
  return result;
}

void print_settings(const std::vector<Entry>& entries) {
  std::cout << "| Setting | Type | Access | What it is |\n|---|---|---|---|\n";
  for (const Entry& entry : entries) {
    if (entry.is_method()) continue;
    std::cout << "| `" << entry.any().name << "` | " << type_name(entry.type()) << " | " << access_words(entry) << " | "
              << cell(entry.any().help) << " |\n";
  }
}

void print_methods(const std::vector<Entry>& entries) {
  std::cout << "| Method | What it does |\n|---|---|\n";
  for (const Entry& entry : entries) {
    if (!entry.is_method()) continue;
    std::cout << "| `" << signature(entry) << "` | " << cell(entry.any().help) << " |\n";
  }
}

}  // namespace

void reference() {
  const auto toolkit = entries_of(Session::members().members);
  const auto position = entries_of(described<cControlPosition>);
  std::cout << "# Reference\n\n"
               "Printed by `talutil reference` from the interface tables; a change there is a change here.\n\n"
               "`ByRef` marks an argument that is written back; `[x = 1]` one that may be left out.\n\n"
               "## Settings of ORVUtils\n\nAll objects of a loaded library share them.\n\n";
  print_settings(toolkit);
  std::cout << "\n## Methods of ORVUtils\n\n";
  print_methods(toolkit);
  std::cout << "\n## Properties of cControlPosition\n\n";
  print_settings(position);
  std::cout << "\n## Methods of cControlPosition\n\n";
  print_methods(position);
}

}  // namespace talutil::cli
