#pragma once

#include <cmath>
#include <string>

#include "platform/win32/windows.hpp"
#include "tests/fakes/error_of.hpp"
#include "tests/fakes/rows.hpp"

/// The platform's own conversions, shown as `outcome` shows ours, and values to try them with.
namespace talutil::testing {

constexpr LCID british_english = 0x0809;
constexpr Locale british{.currency_symbol = {u'\u00A3'}};

/// What a platform function with a result of type T answers; `mismatch` stands for its type mismatch.
template <class T, class Call>
std::string platform_outcome(const Call& call, const char* mismatch = "none") {
  T result{};
  const HRESULT status = call(&result);
  if (status == DISP_E_OVERFLOW) return "error 6";
  if (status != S_OK) return status == DISP_E_TYPEMISMATCH ? mismatch : "status " + std::to_string(status);
  return outcome([&] { return result; });
}

/// The headers of this tool chain want texts that may be written, which no conversion does.
inline OLECHAR* raw(Text& text) { return reinterpret_cast<OLECHAR*>(text.data()); }

}  // namespace talutil::testing
