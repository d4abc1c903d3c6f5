#pragma once

#include <string_view>

#include "calling/recorded_line.hpp"

namespace talutil::calling {

/// Why the answer to a recorded call says nothing about another machine, in words; empty if it does. Such calls may
/// also have effects, so they are not to be made.
[[nodiscard]] std::string_view why_not_comparable(const RecordedLine& record);

/// Whether members, besides hosts, change a setting.
[[nodiscard]] bool is_changed_by_members(std::string_view setting);

}  // namespace talutil::calling
