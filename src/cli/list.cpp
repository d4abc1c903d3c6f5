#include <algorithm>
#include <iostream>

#include "cli/entries.hpp"
#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "cli/session.hpp"
#include "platform/file_names.hpp"
#include "texts/member_texts.hpp"

namespace talutil::cli {

namespace {

struct ListOptions {
  std::string pattern;
  bool json = false;
};

std::string flag(bool value) { return value ? "true" : "false"; }

std::string parameter_json(const Parameter& parameter) {
  std::vector<json::Field> fields{{"name", json::text(parameter.name)},
                                  {"type", json::text(type_name(parameter.type))},
                                  {"written_back", flag(parameter.passing == Passing::written_back)},
                                  {"optional", flag(parameter.is_optional)}};
  if (parameter.is_optional) fields.emplace_back("default", json::value(parameter.default_value(), plain_numbers));
  return json::object(fields);
}

std::string entry_json(const texts::ClassText& text, const Entry& entry) {
  const Member& member = entry.any();
  std::vector<json::Field> fields{{"name", json::text(member.name)},
                                  {"access", json::text(access_words(entry))},
                                  {"type", json::text(type_name(entry.type()))},
                                  {"signature", json::text(signature(entry))},
                                  {"help", json::text(texts::text_of(text, member.name).summary)}};
  if (entry.is_method()) {
    std::vector<std::string> parameters;
    std::ranges::transform(member.parameters(), std::back_inserter(parameters), parameter_json);
    fields.emplace_back("parameters", json::array(parameters));
  }
  return json::object(fields);
}

void print_line(const Entry& entry) {
  constexpr std::size_t access_width = 9;
  std::string line = access_words(entry);
  line.resize(access_width, ' ');
  std::cout << line << signature(entry) << '\n';
}

/// Whether a name fits a pattern with * and ?; a pattern without them is a part of the name.
bool fits(std::string_view name, const Text& pattern) {
  if (pattern.empty()) return true;
  const bool is_part = pattern.find_first_of(u"*?") == Text::npos;
  return name_matches(from_utf8(name), is_part ? u"*" + pattern + u"*" : pattern);
}

void list(const ListOptions& options) {
  std::vector<Entry> entries = entries_of(Session::members().members);
  const Text pattern = utf8_text(options.pattern, "PATTERN");
  std::erase_if(entries, [&](const Entry& entry) { return !fits(entry.any().name, pattern); });
  if (entries.empty()) throw run_time_failure("no member's name fits \"" + options.pattern + "\"");
  if (!options.json) {
    for (const Entry& entry : entries) print_line(entry);
    return;
  }
  const texts::ClassText& text = texts::text_of("ORVUtils");
  std::string separator = "[\n";
  for (const Entry& entry : entries) {
    std::cout << separator << entry_json(text, entry);
    separator = ",\n";
  }
  std::cout << (entries.empty() ? "[]\n" : "\n]\n");
}

}  // namespace

void add_list(CLI::App& app, Work& work) {
  const auto options = std::make_shared<ListOptions>();
  auto* const command = app.add_subcommand("list", "List every member with its access and signature");
  command->add_option("PATTERN", options->pattern, "Part of the name, or a pattern with * and ?");
  add_json(*command, options->json, "As a JSON array");
  choose(*command, work, options, &list);
}

}  // namespace talutil::cli
