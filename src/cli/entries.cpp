#include "cli/entries.hpp"

#include <algorithm>
#include <numeric>

#include "cli/failure.hpp"

namespace talutil::cli {

namespace {

/// The number of letters to insert, remove or change to turn one name into the other, ignoring case.
std::size_t edit_distance(std::string_view a, std::string_view b) {
  std::vector<std::size_t> row(b.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (std::size_t i = 0; i < a.size(); ++i) {
    std::size_t diagonal = row[0];
    row[0] = i + 1;
    for (std::size_t j = 0; j < b.size(); ++j) {
      const std::size_t changed = diagonal + (fold_case(a[i]) == fold_case(b[j]) ? 0 : 1);
      diagonal = row[j + 1];
      row[j + 1] = std::min({changed, row[j] + 1, diagonal + 1});
    }
  }
  return row.back();
}

bool contains_without_case(std::string_view text, std::string_view part) {
  const auto same = [](char a, char b) { return fold_case(a) == fold_case(b); };
  return std::search(text.begin(), text.end(), part.begin(), part.end(), same) != text.end();
}

/// The names that were probably meant, the most likely first.
std::vector<std::string_view> nearest_names(std::span<const Member> members, std::string_view typed) {
  constexpr std::size_t most_names = 4;
  constexpr std::size_t shortest_part = 3;
  const std::size_t most_edits = 1 + typed.size() / 6;
  std::vector<std::pair<std::size_t, std::string_view>> near;
  for (const Entry& entry : entries_of(members)) {
    const std::string_view name = entry.any().name;
    std::size_t distance = edit_distance(typed, name);
    // Part of a name also counts as near, but after every real typing error.
    const bool is_part = typed.size() >= shortest_part && contains_without_case(name, typed);
    if (distance > most_edits && !is_part) continue;
    if (distance > most_edits) distance += typed.size();
    near.emplace_back(distance, name);
  }
  std::ranges::stable_sort(near, {}, &std::pair<std::size_t, std::string_view>::first);
  if (near.size() > most_names) near.resize(most_names);
  std::vector<std::string_view> names;
  std::ranges::transform(near, std::back_inserter(names), &std::pair<std::size_t, std::string_view>::second);
  return names;
}

std::string unknown_member_message(std::span<const Member> members, std::string_view typed) {
  std::string message = "there is no member \"" + std::string(typed) + "\"; ";
  const auto names = nearest_names(members, typed);
  if (names.empty()) return message + "\"talutil list\" shows all";
  message += "did you mean ";
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (i > 0) message += i + 1 == names.size() ? " or " : ", ";
    message += names[i];
  }
  return message + "?";
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
