#pragma once

#include <optional>
#include <vector>

#include "automation/text.hpp"

namespace talutil::archives {

/// Where an entry may be written below the destination folder, part by part; nothing for a name that is refused.
///
/// Made safe: a leading drive or separator goes ("C:\x", "/x" and "\\server\x" lie below the destination), what no
/// file of Windows may have in its name becomes "_" (`<>:"|?*`, control characters, blanks and dots at the end of a
/// part), and device names get a "_" before them ("CON.txt" is "_CON.txt"). Refused: ".." anywhere, an empty name, one
/// with a NUL, a part above 255 and a path above 32,000 code units.
[[nodiscard]] std::optional<std::vector<Text>> safe_parts(TextView name);

}  // namespace talutil::archives
