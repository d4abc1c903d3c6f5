#include "cli/cleaner.hpp"

#include <array>

#include "cli/entries.hpp"
#include "cli/failure.hpp"
#include "cli/json.hpp"

namespace talutil::cli {

Cleaner::Cleaner(Session& session)
    : session_(session),
      locale_(session.locale()),
      list_reader_(*find_entry(Session::members().members, "ReadCommaDelimStrToList").call) {}

Text Cleaner::clean(const std::vector<PlanStep>& steps, Text value) {
  for (const PlanStep& step : steps) value = step.is_list ? run_list(step, std::move(value)) : run(step, value);
  return value;
}

Text Cleaner::run(const PlanStep& step, const Text& value) {
  std::vector<Argument> arguments(step.arguments.begin(), step.arguments.end());
  arguments[step.value_place].value = value;
  try {
    return session_.call(*step.member, arguments).to_text(locale_);
  } catch (const RunTimeError& error) {
    throw run_time_failure(std::string(step.member->name) + ": " + error_words(error) + "; the value is " +
                           json::text(value));
  }
}

Text Cleaner::run_list(const PlanStep& step, Text value) {
  // Close an open list first, because the reader drops the text after the last comma.
  if (!value.empty() && value.back() != u',') value += u',';
  std::array<Argument, 2> arguments{Variant(std::move(value)), Variant()};
  session_.call(list_reader_, arguments);
  Text result;
  if (const auto* const list = arguments[1].value.get_if<TextArray>()) {
    for (const Text& element : list->items) result += run(step, element) + u',';
  }
  return result;
}

}  // namespace talutil::cli
