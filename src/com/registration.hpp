#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::com {

/// Whose registry the classes go to: the machine's (administrators only) or the user's own.
enum class RegistrationScope { machine, user };

/// Writes the entries of both classes and of the type library; a failure takes back what was written.
[[nodiscard]] HRESULT register_library(RegistrationScope scope) noexcept;

/// Removes the same entries; those that are not there are no failure.
[[nodiscard]] HRESULT unregister_library(RegistrationScope scope) noexcept;

}  // namespace talutil::com
