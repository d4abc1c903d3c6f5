#pragma once

#include "automation/text.hpp"

/// Names and values as export writes them into a profile file, which cannot hold every text: "\\" stands for a
/// backslash and "\uXXXX" for a code unit that would not come back.
namespace talutil::cli::escapes {

[[nodiscard]] Text write(TextView text);

/// Fails for a backslash that begins neither of the two.
[[nodiscard]] Text read(TextView text);

}  // namespace talutil::cli::escapes
