#pragma once

#include <cmath>
#include <random>
#include <string>

#include "platform/win32/windows.hpp"
#include "tests/automation/outcome.hpp"

/// The platform's own conversions, shown as `outcome` shows ours, and values to try them with.
namespace talutil {

constexpr LCID british_english = 0x0809;
constexpr Locale british{.currency_symbol = {u'\u00A3'}};
constexpr int generated_count = 10000;

inline Variant to_value(Variant value) { return value; }
inline Variant to_value(double value) { return value; }
inline Variant to_value(SHORT value) { return value; }
inline Variant to_value(LONG value) { return static_cast<std::int32_t>(value); }
inline Variant to_value(CY value) { return Currency{value.int64}; }
inline Variant to_value(BSTR value) {
  const Text text(win32::view(value, SysStringLen(value)));
  SysFreeString(value);
  return text;
}

/// What a platform function with a result of type T answers; `mismatch` stands for its type mismatch.
template <class T, class Call>
std::string platform_outcome(const Call& call, const char* mismatch = "none") {
  T result{};
  const HRESULT status = call(&result);
  if (status == DISP_E_OVERFLOW) return "error 6";
  if (status != S_OK) return status == DISP_E_TYPEMISMATCH ? mismatch : "status " + std::to_string(status);
  return outcome([&] { return to_value(result); });
}

/// Deliberate: a fraction that needs more decimal places than digits are shown has an exponent, as on Windows; Wine
/// writes one only below 0.0001.
inline bool is_long_fraction(const std::string& text) {
  return text.ends_with("E-02") || text.ends_with("E-03") || text.ends_with("E-04");
}

/// The headers of this tool chain want texts that may be written, which no conversion does.
inline OLECHAR* raw(Text& text) { return reinterpret_cast<OLECHAR*>(text.data()); }

/// Reproducible: the same values in every run.
class Generator {
 public:
  std::int32_t whole(std::int32_t first, std::int32_t last) {
    return std::uniform_int_distribution<std::int32_t>(first, last)(engine_);
  }

  /// Numbers as hosts have them, of every size, plainly decimal, halves, or any bits at all.
  double number() {
    const double base = whole(-1000000, 1000000);
    switch (whole(0, 3)) {
      case 0:
        return base / 2;
      case 1:
        return base / std::pow(10, whole(0, 12));
      case 2:
        return base * std::pow(10, whole(0, 20));
      default:
        return std::ldexp(base + whole(0, 1 << 30) * 0x1p-30, whole(-300, 300));
    }
  }

  template <class Items>
  const auto& one_of(const Items& items) {
    return items[static_cast<std::size_t>(whole(0, static_cast<std::int32_t>(std::size(items)) - 1))];
  }

 private:
  std::mt19937 engine_{20090305};
};

}  // namespace talutil
