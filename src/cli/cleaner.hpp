#pragma once

#include "cli/plan.hpp"
#include "cli/session.hpp"

namespace talutil::cli {

/// Passes values through the members of a plan.
class Cleaner {
 public:
  explicit Cleaner(Session& session);

  /// A value after all steps of its column. A run-time error fails with the names of the member and the value.
  [[nodiscard]] Text clean(const std::vector<PlanStep>& steps, Text value);

 private:
  [[nodiscard]] Text run(const PlanStep& step, const Text& value);
  [[nodiscard]] Text run_list(const PlanStep& step, Text value);

  Session& session_;
  Locale locale_;
  const Member& list_reader_;
};

}  // namespace talutil::cli
