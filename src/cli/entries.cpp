#include "cli/entries.hpp"

#include <algorithm>

#include "cli/failure.hpp"
#include "cli/near_names.hpp"

namespace talutil::cli {

namespace {

std::string unknown_member_message(std::span<const Member> members, std::string_view typed) {
  const std::string message = "there is no member \"" + std::string(typed) + "\"; ";
  std::vector<std::string_view> names;
  for (const Entry& entry : entries_of(members)) names.push_back(entry.any().name);
  const auto nearest = nearest_names(names, typed);
  return message + (nearest.empty() ? "\"talutil list\" shows all" : did_you_mean(nearest));
}

std::string parameter_words(const Parameter& parameter) {
  std::string words = parameter.passing == Passing::written_back ? "ByRef " : "";
  words += parameter.name;
  words += " As ";
  words += type_name(parameter.type);
  return parameter.is_optional ? "[" + words + " = " + default_words(parameter) + "]" : words;
}

}  // namespace

std::vector<Entry> entries_of(std::span<const Member> members) {
  std::vector<Entry> entries;
  for (const Member& member : members) {
    auto found =
        std::ranges::find(entries, member.identifier, [](const Entry& entry) { return entry.any().identifier; });
    if (found == entries.end()) found = entries.insert(found, Entry{});
    (member.access == Access::get ? found->get : member.access == Access::put ? found->put : found->call) = &member;
  }
  return entries;
}

Entry find_entry(std::span<const Member> members, std::string_view name) {
  const auto entries = entries_of(members);
  const auto found =
      std::ranges::find_if(entries, [&](const Entry& entry) { return same_name(entry.any().name, name); });
  if (found == entries.end()) throw usage_failure(unknown_member_message(members, name));
  return *found;
}

std::string_view type_name(ValueType type) noexcept {
  switch (type) {
    case ValueType::boolean:
      return "Boolean";
    case ValueType::int16:
      return "Integer";
    case ValueType::int32:
      return "Long";
    case ValueType::single:
      return "Single";
    case ValueType::date:
      return "Date";
    case ValueType::text:
      return "String";
    case ValueType::variant:
      return "Variant";
    case ValueType::text_array:
      return "String()";
    case ValueType::system_time:
      return "SYSTEMTIME";
    case ValueType::object:
      return "Object";
    case ValueType::none:
      break;
  }
  return "";
}

std::span<const Parameter> parameters_of(const Entry& entry) noexcept {
  if (entry.call != nullptr) return entry.call->parameters();
  if (entry.get != nullptr) return entry.get->parameters();
  return entry.put->parameters().first(entry.put->parameters().size() - 1);
}

std::string access_words(const Entry& entry) {
  if (entry.is_method()) return "call";
  if (entry.get != nullptr && entry.put != nullptr) return "get put";
  return entry.get != nullptr ? "get" : "put";
}

std::string signature(const Entry& entry) {
  std::string words(entry.any().name);
  const auto parameters = parameters_of(entry);
  if (entry.is_method() || !parameters.empty()) {
    words += "(";
    std::string_view separator;
    for (const Parameter& parameter : parameters) {
      words += separator;
      words += parameter_words(parameter);
      separator = ", ";
    }
    words += ")";
  }
  if (entry.type() != ValueType::none) words += " As ";
  return words += type_name(entry.type());
}

std::string default_words(const Parameter& parameter) {
  if (!parameter.is_optional) return {};
  const std::string text = to_utf8(parameter.default_value().to_text(plain_numbers));
  return parameter.type == ValueType::text ? '"' + text + '"' : text;
}

}  // namespace talutil::cli
