#pragma once

namespace talutil {

/// The version of the library, of the command and of the DLL's resource.
inline constexpr const char* version_text = "1.0.0";

}  // namespace talutil
