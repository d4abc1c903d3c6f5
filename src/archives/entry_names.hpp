#pragma once

#include <optional>
#include <vector>

#include "automation/text.hpp"

namespace talutil::archives {

/// The path of an entry below the destination folder, part by part; nothing if the name is refused.
///
/// Made safe: a leading drive or separator is removed ("C:\x", "/x" and "\\server\x" end up below the destination);
/// characters that Windows does not allow in file names become "_" (`<>:"|?*`, control characters, and blanks and dots
/// at the end of a part); device names get a leading "_" ("CON.txt" becomes "_CON.txt"). Refused: ".." anywhere, an
/// empty name, a name with a NUL, a part longer than 255 and a path longer than 32,000 code units or deeper than 1,000
/// folders.
[[nodiscard]] std::optional<std::vector<Text>> safe_parts(TextView name);

/// The same for a system that allows every character but "/": the names are the entry's own, and only what would lead
/// out of the destination is removed or refused. A backslash and a drive's colon are part of a name.
[[nodiscard]] std::optional<std::vector<Text>> own_parts(TextView name);

/// Whether a name, such as "./", refers to the destination folder itself.
[[nodiscard]] bool is_destination(TextView name);

}  // namespace talutil::archives
