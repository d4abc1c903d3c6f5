#pragma once

#include "platform/platform.hpp"

namespace talutil::testing {

/// Writes a report of some pages as PDF. Apart from the rest, because windows.h gives StartDoc another name.
void write_report(const Platform& platform, const Text& file);

}  // namespace talutil::testing
