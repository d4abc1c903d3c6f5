#pragma once

#include <typeinfo>

#include "library/orv_utils.hpp"

namespace talutil {

/// Whether somebody may see which members a member calls: only a derived class can override them. For all others, a
/// member may do at once what a row of calls would do.
[[nodiscard]] inline bool may_see_calls(const ORVUtils& utils) noexcept { return typeid(utils) != typeid(ORVUtils); }

}  // namespace talutil
