#pragma once

#include "library/library.hpp"
#include "platform/win32/windows.hpp"

/// The loaded DLL: the only state that outlives a call.
namespace talutil::com {

[[nodiscard]] HINSTANCE module_handle() noexcept;

/// The library. The first call creates and starts it, before the first object is handed out; from then on the DLL stays
/// in the process. Not callable from DllMain: the start-up creates controls, which the loader lock forbids. Raises the
/// errors of the start-up, and tries again on the next call; raises 429 if called during the start-up.
[[nodiscard]] Library& module_library();

class Recorder;

/// The recording of calls; null unless the user has switched it on.
[[nodiscard]] Recorder* module_recorder() noexcept;

/// The type information of an interface or class, from the type library in the DLL's resources, which is loaded once.
[[nodiscard]] HRESULT type_information(const GUID& identifier, ITypeInfo** out) noexcept;

/// A class or interface identifier of library/identity.hpp.
[[nodiscard]] constexpr GUID guid_of(std::string_view text) {
  const auto digit = [](char c) { return static_cast<unsigned>(c <= '9' ? c - '0' : (c | 0x20) - 'a' + 10); };
  const auto number = [&](std::size_t at, std::size_t digits) {
    unsigned long value = 0;
    for (std::size_t i = 0; i < digits; ++i) value = value * 16 + digit(text[at + i]);
    return value;
  };
  GUID result{number(0, 8), static_cast<WORD>(number(9, 4)), static_cast<WORD>(number(14, 4)), {}};
  for (std::size_t i = 0; i < 8; ++i) {
    result.Data4[i] = static_cast<BYTE>(number(i < 2 ? 19 + 2 * i : 20 + 2 * i, 2));
  }
  return result;
}

}  // namespace talutil::com
