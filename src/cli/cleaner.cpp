#include "cli/cleaner.hpp"

#include <array>

#include "cli/entries.hpp"
#include "cli/failure.hpp"
#include "cli/json.hpp"

namespace talutil::cli {

ColumnCleaner::ColumnCleaner(Session& session, std::vector<PlanStep> steps)
    : session_(session),
      locale_(session.locale()),
      list_reader_(*find_entry(Session::members().members, "ReadCommaDelimStrToList").call) {
  for (PlanStep& plan : steps) {
    Step& step = steps_.emplace_back();
    step.arguments.assign(plan.arguments.begin(), plan.arguments.end());
    for (std::size_t i = 0; i < plan.arguments.size(); ++i) {
      if (plan.member->parameters()[i].passing == Passing::written_back) step.written_back.push_back(i);
    }
    step.plan = std::move(plan);
  }
}

void ColumnCleaner::clean(Text& value) {
  for (Step& step : steps_) {
    value = step.plan.is_list ? run_list(step, std::move(value)) : run(step, std::move(value));
  }
}

Text ColumnCleaner::run(Step& step, Text value) {
  Variant& place = step.arguments[step.plan.value_place].value;
  try {
    for (const std::size_t each : step.written_back) step.arguments[each] = step.plan.arguments[each];
    place = Variant(std::move(value));
    Variant result = session_.call(*step.plan.member, step.arguments, locale_);
    if (Text* const text = result.get_if<Text>()) return std::move(*text);
    return result.to_text(locale_);
  } catch (const RunTimeError& error) {
    // The member may have written to it, but an error usually comes before that.
    const auto* const held = place.get_if<Text>();
    throw Failure(run_time_status,
                  std::string(step.plan.member->name) + ": " + error_words(error) + "; the value is " +
                      (held == nullptr ? "another kind now" : json::text(*held)),
                  error.number());
  }
}

Text ColumnCleaner::run_list(Step& step, Text value) {
  // Close an open list first, because the reader drops the text after the last comma.
  if (!value.empty() && value.back() != u',') value += u',';
  std::array<Argument, 2> arguments{Variant(std::move(value)), Variant()};
  session_.call(list_reader_, arguments, locale_);
  Text result;
  if (auto* const list = arguments[1].value.get_if<TextArray>()) {
    for (Text& element : list->items) result += run(step, std::move(element)) + u',';
  }
  return result;
}

}  // namespace talutil::cli
