#include "cli/plan.hpp"

#include <algorithm>
#include <span>
#include <unordered_set>

#include "cli/arguments.hpp"
#include "cli/entries.hpp"
#include "cli/failure.hpp"

namespace talutil::cli {

namespace {

using Words = std::span<const std::string>;

constexpr std::string_view blanks = " \t\r";

/// Splits a line into words, up to a comment; quotes in a quoted word are doubled.
std::vector<std::string> words_of(std::string_view line) {
  std::vector<std::string> words;
  while (true) {
    line.remove_prefix(std::min(line.find_first_not_of(blanks), line.size()));
    if (line.empty() || line.front() == '#') return words;
    std::string& word = words.emplace_back();
    if (line.front() != '"') {
      word = line.substr(0, line.find_first_of(blanks));
      line.remove_prefix(word.size());
      continue;
    }
    do {
      const std::size_t close = line.find('"', 1);
      if (close == std::string_view::npos) throw usage_failure("a quote is never closed");
      if (!word.empty()) word += '"';
      word += line.substr(1, close - 1);
      line.remove_prefix(close + 1);
    } while (line.starts_with('"'));
  }
}

PlanStep read_step(Words words, std::span<const Member> members, const Locale& locale) {
  PlanStep step;
  step.is_list = !words.empty() && words.front() == "list";
  if (step.is_list) words = words.subspan(1);
  if (words.empty()) throw usage_failure("a member is missing; write one such as VerifyTextData 40 0");
  const Entry entry = find_entry(members, words.front());
  const std::string name(entry.any().name);
  if (!entry.is_method() || entry.call->result == ValueType::none) {
    throw usage_failure(name + " gives no value back; use a member that does");
  }
  step.member = entry.call;
  words = words.subspan(1);

  const auto star = std::ranges::find(words, "*");
  step.value_place = static_cast<std::size_t>(star - words.begin());
  const std::size_t count = words.size() + (star == words.end() ? 1 : 0);
  const auto parameters = step.member->parameters();
  if (count > parameters.size() || (count < parameters.size() && !parameters[count].is_optional)) {
    throw usage_failure(name + " takes " + std::to_string(parameters.size()) + " arguments and got " +
                        std::to_string(count) + ", the column's value included; see \"talutil help " + name + "\"");
  }
  step.arguments.resize(count);
  for (std::size_t i = 0; i < words.size(); ++i) {
    if (i == step.value_place) continue;
    step.arguments[i] = within(name + ": " + std::string(parameters[i].name),
                               [&] { return argument_for(parameters[i], words[i], locale); });
  }
  return step;
}

PlanColumn read_column(Words words, std::span<const Member> members, const Locale& locale) {
  PlanColumn column{words.front(), {}};
  words = words.subspan(1);
  while (true) {
    const auto bar = std::ranges::find(words, "|");
    const auto length = static_cast<std::size_t>(bar - words.begin());
    column.steps.push_back(read_step(words.first(length), members, locale));
    if (bar == words.end()) return column;
    words = words.subspan(length + 1);
  }
}

}  // namespace

std::vector<PlanColumn> read_plan(std::string_view text, std::span<const Member> members, const Locale& locale) {
  std::vector<PlanColumn> plan;
  std::unordered_set<std::string> names;
  for (std::size_t number = 1; !text.empty(); ++number) {
    const std::string_view line = text.substr(0, text.find('\n'));
    text.remove_prefix(std::min(line.size() + 1, text.size()));
    within("line " + std::to_string(number), [&] {
      const auto words = words_of(line);
      if (words.empty()) return;
      if (!names.insert(words.front()).second) {
        throw usage_failure("column \"" + words.front() + "\" stands twice");
      }
      plan.push_back(read_column(words, members, locale));
    });
  }
  return plan;
}

}  // namespace talutil::cli
