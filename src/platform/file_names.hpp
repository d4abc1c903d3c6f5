#pragma once

#include "automation/text.hpp"

namespace talutil {

/// Both are understood on both platforms; the first is the one in paths that the library gives.
constexpr TextView separators = u"\\/";

/// The part after the last separator, and after a drive's colon.
[[nodiscard]] TextView last_part(TextView path) noexcept;

/// True for a path that names a folder's contents rather than the folder: it ends in a separator or a colon.
[[nodiscard]] bool is_open_ended(TextView path) noexcept;

/// Names that are devices in every folder, whatever follows a dot, blank or colon: CON, NUL, COM1 and their like.
[[nodiscard]] bool is_device_name(TextView part);

/// Checks the path of a file to be opened. Raises 75 for an empty one and 52 for one that names no file: with a NUL
/// or one of `*?"<>|` in it, of a device (CON, NUL, COM1, with any extension), or in the device name space (\\.\).
void require_file_name(TextView path);

/// Checks what is to be searched for. Raises 52 for a NUL or one of `"<>|`, and for a wildcard before the last part.
void require_pattern(TextView pattern);

/// Whether a name matches a pattern as the platform's file system matches them, without regard to case: "*.*" matches
/// every name, "*." those without a dot, and a "?" before a dot or at the end matches nothing too. Short names of
/// another form do not count: "*.htm" does not match "a.html".
[[nodiscard]] bool name_matches(TextView name, TextView pattern);

}  // namespace talutil
