#pragma once

// The only place that includes the platform's headers.
#define WIN32_LEAN_AND_MEAN
#ifndef NOMINMAX
#define NOMINMAX
#endif
#include <windows.h>
// After windows.h.
#include <oaidl.h>
#include <ocidl.h>
#include <ole2.h>
#include <oleauto.h>
#include <olectl.h>

#include "automation/text.hpp"

namespace talutil::win32 {

// The platform's wide characters and our code units are both 16 bits wide.
inline const wchar_t* wide(const char16_t* text) noexcept { return reinterpret_cast<const wchar_t*>(text); }
inline const wchar_t* wide(const Text& text) noexcept { return wide(text.c_str()); }
inline TextView view(const wchar_t* text, std::size_t length) noexcept {
  return {reinterpret_cast<const char16_t*>(text), length};
}

}  // namespace talutil::win32
