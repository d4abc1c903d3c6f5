#pragma once

#include "automation/text.hpp"

namespace talutil {

/// Both are accepted on both platforms; paths that the library returns use the first.
constexpr TextView separators = u"\\/";

/// The part after the last separator, and after a drive's colon.
[[nodiscard]] TextView last_part(TextView path) noexcept;

/// True if a path refers to a folder's contents rather than the folder itself: it ends in a separator or a colon.
[[nodiscard]] bool is_open_ended(TextView path) noexcept;

/// True for names that are devices in every folder, whatever follows a dot, blank or colon: CON, NUL, COM1 and so on.
[[nodiscard]] bool is_device_name(TextView part);

/// Checks the path of a file to be opened. Raises 75 if it is empty and 52 if it cannot name a file: if it contains a
/// NUL or one of `*?"<>|`, names a device (CON, NUL, COM1, with any extension), or is in the device namespace (\\.\).
void require_file_name(TextView path);

/// Checks a search pattern. Raises 52 for a NUL or one of `"<>|`, and for a wildcard before the last part.
void require_pattern(TextView pattern);

/// Whether a name matches a pattern by the rules of the platform's file system, ignoring case: "*.*" matches every
/// name, "*." names without a dot, and a "?" before a dot or at the end also matches nothing. Short (8.3) names are not
/// considered: "*.htm" does not match "a.html".
[[nodiscard]] bool name_matches(TextView name, TextView pattern);

}  // namespace talutil
