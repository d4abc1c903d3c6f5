#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "automation/member_table.hpp"

namespace talutil::cli {

/// A member through which a value passes, with the other arguments.
struct PlanStep {
  bool is_list = false;  ///< Applies to each element of a comma-separated list, which is then closed by a comma.
  const Member* member = nullptr;
  std::vector<Variant> arguments;  ///< Complete except for the value.
  std::size_t value_place = 0;
};

struct PlanColumn {
  std::string name;
  std::vector<PlanStep> steps;
};

/// Reads a plan, with one line per column: the column's name, then its steps, separated by "|". A step is a member and
/// its arguments as for "talutil call"; the value comes last, or in place of "*". "list" before a member cleans each
/// element of a comma-separated list. Words with blanks are in double quotes; a word that begins with "#" begins a
/// comment. Fails with the line number and the error.
[[nodiscard]] std::vector<PlanColumn> read_plan(std::string_view text, std::span<const Member> members,
                                                const Locale& locale);

}  // namespace talutil::cli
