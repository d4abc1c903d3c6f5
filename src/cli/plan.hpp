#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "automation/member_table.hpp"

namespace talutil::cli {

/// One member that a value passes through, with its other arguments.
struct PlanStep {
  bool is_list = false;  ///< Each element of a comma list passes through, and the list is closed by a comma.
  const Member* member = nullptr;
  std::vector<Variant> arguments;  ///< Complete but for the value's place.
  std::size_t value_place = 0;
};

struct PlanColumn {
  std::string name;
  std::vector<PlanStep> steps;
};

/// Reads a plan, one line a column: the column's name, then its steps, joined by "|". A step is a member and its
/// arguments as "talutil call" takes them; the value comes last, or where "*" stands. "list" in front of a
/// member cleans each element of a comma list. Words with blanks stand in double quotes; lines that begin
/// with "#" are remarks. A fault fails with its line and what is wrong.
[[nodiscard]] std::vector<PlanColumn> read_plan(std::string_view text, std::span<const Member> members,
                                                const Locale& locale);

}  // namespace talutil::cli
