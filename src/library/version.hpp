#pragma once

namespace talutil {

/// The version of the library, the command and the DLL's resources.
inline constexpr const char* version_text = "1.0.0";

}  // namespace talutil
