#pragma once

#include "automation/text.hpp"

namespace talutil {

/// Converts a name, suburb or address line to name case: each word gets a capital followed by lower case, except for
/// the spellings, prefixes and particles in name_case_table.hpp. docs/name-case.md has the rules. The case of the input
/// does not matter, the result has the same length, and converting it again changes nothing.
[[nodiscard]] Text name_case(TextView text);

}  // namespace talutil
