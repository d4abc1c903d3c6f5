#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::com {

/// Where to register: for the machine (administrators only) or for the current user.
enum class RegistrationScope { machine, user };

/// Writes the entries of all classes and of the type library; on failure removes what it wrote.
[[nodiscard]] HRESULT register_library(RegistrationScope scope) noexcept;

/// Removes the same entries; missing ones are not an error.
[[nodiscard]] HRESULT unregister_library(RegistrationScope scope) noexcept;

}  // namespace talutil::com
