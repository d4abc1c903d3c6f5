#pragma once

#include <vector>

#include "cli/plan.hpp"
#include "cli/session.hpp"

namespace talutil::cli {

/// Passes the values of a column through the members of its plan.
class ColumnCleaner {
 public:
  ColumnCleaner(Session& session, std::vector<PlanStep> steps);

  /// A value after all steps. A run-time error fails with the names of the member and the value.
  void clean(Text& value);

 private:
  /// A step with its arguments laid out once, not for every value.
  struct Step {
    PlanStep plan;
    std::vector<Argument> arguments;
    std::vector<std::size_t> written_back;  ///< The arguments that the member can change.
  };

  [[nodiscard]] Text run(Step& step, Text value);
  [[nodiscard]] Text run_list(Step& step, Text value);

  Session& session_;
  Locale locale_;
  const Member& list_reader_;
  std::vector<Step> steps_;
};

}  // namespace talutil::cli
