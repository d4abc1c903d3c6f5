#pragma once

#include "automation/text.hpp"

namespace talutil::win32 {

/// What marks a path that the system uses literally and without a length limit.
constexpr TextView extended_prefix = u"\\\\?\\";

/// A full path in the extended form; an empty one is the current folder. Raises 76 for a path that the system cannot
/// resolve.
[[nodiscard]] Text extended_path(const Text& path);

}  // namespace talutil::win32
