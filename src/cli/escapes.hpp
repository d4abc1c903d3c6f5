#pragma once

#include "automation/text.hpp"

/// Names and values as export writes them to a profile file, which cannot hold every text: "\\" stands for a backslash
/// and "\uXXXX" for a code unit that would not survive.
namespace talutil::cli::escapes {

[[nodiscard]] Text write(TextView text);

/// Fails for a backslash that does not begin either of these.
[[nodiscard]] Text read(TextView text);

}  // namespace talutil::cli::escapes
