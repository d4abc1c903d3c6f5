#include <algorithm>
#include <iostream>

#include "cli/arguments.hpp"
#include "cli/commands.hpp"
#include "cli/entries.hpp"
#include "cli/session.hpp"

namespace talutil::cli {

namespace {

/// For example "Long, -2147483648 to 2147483647; written back".
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

void print_arguments(std::span<const Parameter> parameters) {
  std::size_t width = 0;
  for (const Parameter& parameter : parameters) width = std::max(width, parameter.name.size());
  if (!parameters.empty()) std::cout << '\n';
  for (const Parameter& parameter : parameters) {
    std::string name(parameter.name);
    name.resize(width + 2, ' ');
    std::cout << "  " << name << argument_words(parameter) << '\n';
  }
}

void print_usage(const Entry& entry) {
  std::cout << "\n  talutil call " << entry.any().name;
  if (entry.is_method()) {
    for (const Parameter& parameter : entry.call->parameters()) {
      const std::string name(parameter.name);
      std::cout << ' ' << (parameter.is_optional ? "[" + name + "]" : name);
    }
  } else if (entry.put != nullptr) {
    std::cout << (entry.get != nullptr ? " [value]" : " value");
  }
  std::cout << '\n';
}

}  // namespace

void help(const std::string& member) {
  const Entry entry = find_entry(Session::members().members, member);
  std::cout << signature(entry) << "\n\n  " << entry.any().help << '\n';
  if (entry.is_method()) {
    print_arguments(entry.call->parameters());
  } else {
    std::cout << "\n  A setting (" << access_words(entry) << "), shared by all objects of the library.\n";
  }
  print_usage(entry);
}

}  // namespace talutil::cli
