#pragma once

#include "automation/text.hpp"

namespace talutil {

/// A name, suburb or address line in name case: each word with a capital and then lower case, apart from the spellings,
/// prefixes and particles of name_case_table.hpp. The rules stand in docs/name-case.md. The case of the input plays no
/// part, the result is as long as the input, and converting it once more changes nothing.
[[nodiscard]] Text name_case(TextView text);

}  // namespace talutil
