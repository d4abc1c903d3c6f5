#include <algorithm>
#include <iostream>

#include "cli/classes.hpp"
#include "cli/commands.hpp"
#include "cli/help_json.hpp"
#include "cli/json.hpp"

namespace talutil::cli {

namespace {

using texts::MemberText;

std::string flag(bool value) { return value ? "true" : "false"; }

template <class Items, class Json>
std::string list_json(const Items& items, const Json& to_json) {
  std::vector<std::string> values;
  for (const auto& item : items) values.push_back(to_json(item));
  return json::array(values);
}

std::string text_json(std::string_view text) { return json::text(text); }

std::string error_json(const texts::RaisedError& error) {
  return json::object({{"number", std::to_string(error.number)}, {"when", json::text(error.when)}});
}

std::string example_json(const texts::Example& example) {
  return json::object({{"title", json::text(example.title)},
                       {"code", json::text(example.code)},
                       {"windows", flag(example.shows_window)}});
}

std::string parameters_json(const Entry& entry, const MemberText& text) {
  const auto parameters = parameters_of(entry);
  std::vector<std::string> values;
  for (std::size_t i = 0; i < parameters.size(); ++i) {
    const Parameter& parameter = parameters[i];
    const std::string_view meaning = i < text.parameters.size() ? text.parameters[i].text : std::string_view();
    values.push_back(json::object({{"name", json::text(parameter.name)},
                                   {"type", json::text(type_name(parameter.type))},
                                   {"written_back", flag(parameter.passing == Passing::written_back)},
                                   {"optional", flag(parameter.is_optional)},
                                   {"default", json::text(default_words(parameter))},
                                   {"text", json::text(meaning)}}));
  }
  return json::array(values);
}

std::vector<json::Field> description(const MemberText& text) {
  return {{"name", json::text(text.name)},
          {"summary", json::text(text.summary)},
          {"details", json::text(text.details)},
          {"examples", list_json(text.examples, example_json)}};
}

std::string member_json(const PublishedClass& owner, const Entry& entry) {
  const MemberText& text = owner.text_of(entry);
  std::vector<json::Field> fields = description(text);
  const std::initializer_list<json::Field> more = {
      {"family", json::text(text.family)},           {"access", json::text(access_words(entry))},
      {"type", json::text(type_name(entry.type()))}, {"signature", json::text(signature(entry))},
      {"parameters", parameters_json(entry, text)},  {"errors", list_json(text.errors, error_json)},
      {"reads", list_json(text.reads, text_json)},   {"changes", list_json(text.changes, text_json)},
      {"see", list_json(text.see, text_json)}};
  fields.insert(fields.end(), more);
  return json::object(fields);
}

std::string class_json(const PublishedClass& owner) {
  std::vector<json::Field> fields = description(owner.text->text);
  fields.emplace_back("program_id", json::text(owner.program_id));
  fields.emplace_back(
      "members", list_json(entries_of(owner.members), [&](const Entry& entry) { return member_json(owner, entry); }));
  return json::object(fields);
}

/// A member by itself, which has to say whose it is.
std::string single_member_json(const PublishedClass& owner, const Entry& entry) {
  return "{\"class\": " + json::text(owner.name()) + ", " + member_json(owner, entry).substr(1);
}

}  // namespace

void help_json(const std::string& name) {
  if (name.empty()) {
    for (const PublishedClass& owner : published_classes()) {
      for (const Entry& entry : entries_of(owner.members)) std::cout << single_member_json(owner, entry) << '\n';
    }
    return;
  }
  const Subject subject = find_subject(name);
  std::cout << (subject.member ? single_member_json(subject.owner, *subject.member) : class_json(subject.owner))
            << '\n';
}

void reference_json() {
  std::cout << json::object({{"families", list_json(texts::families(), text_json)},
                             {"classes", list_json(published_classes(), class_json)}})
            << '\n';
}

}  // namespace talutil::cli
