#pragma once

#include <cstdio>
#include <exception>
#include <source_location>
#include <string>
#include <string_view>
#include <type_traits>

#include "platform/win32/windows.hpp"

/// The checks that the client programs share: one line for each that fails, and the counts as the last line.
namespace talutil::hosts {

struct Counts {
  int passed = 0;
  int failed = 0;
};

inline Counts counts;

inline std::string narrow(std::wstring_view text) {
  std::string result;
  for (const wchar_t c : text) {
    std::array<char, 8> code{};
    std::snprintf(code.data(), code.size(), c >= 0x20 && c < 0x7f ? "%lc" : "\\x%02x", static_cast<unsigned>(c));
    result += code.data();
  }
  return "\"" + result + "\"";
}

template <class T>
std::string shown(const T& value) {
  if constexpr (std::is_convertible_v<const T&, std::wstring_view>) {
    return narrow(value);
  } else if constexpr (std::is_same_v<T, HRESULT>) {
    // Also what a LONG looks like: small values are easier to read as numbers.
    std::array<char, 16> text{};
    std::snprintf(text.data(), text.size(), value < 0 ? "0x%08lX" : "%ld", value);
    return text.data();
  } else if constexpr (std::is_pointer_v<T>) {
    return value == nullptr ? "a null pointer" : "a pointer";
  } else {
    return std::to_string(value);
  }
}

inline bool check(bool condition, const std::string& what,
                  const std::source_location& at = std::source_location::current()) {
  ++(condition ? counts.passed : counts.failed);
  if (!condition) {
    const std::string_view path = at.file_name();
    const std::string_view file = path.substr(path.find_last_of('/') + 1);
    std::printf("FAILED %.*s:%u: %s\n", static_cast<int>(file.size()), file.data(), static_cast<unsigned>(at.line()),
                what.c_str());
    std::fflush(stdout);
  }
  return condition;
}

template <class Expected, class Got>
bool check_equal(const Expected& expected, const Got& got, const std::string& what,
                 const std::source_location& at = std::source_location::current()) {
  if constexpr (std::is_convertible_v<const Got&, std::string_view>) {
    const std::string_view wanted(expected);
    return check(wanted == got, what + ": expected " + std::string(wanted) + ", got " + std::string(got), at);
  } else if constexpr (std::is_convertible_v<const Got&, std::wstring_view>) {
    const std::wstring_view wanted(expected);
    return check(wanted == std::wstring_view(got), what + ": expected " + narrow(wanted) + ", got " + narrow(got), at);
  } else {
    const Got wanted = static_cast<Got>(expected);
    return check(wanted == got, what + ": expected " + shown(wanted) + ", got " + shown(got), at);
  }
}

/// Runs the checks of a program in an apartment. A program that dies prints no counts, which counts as a failure.
template <class Checks>
int run_checks(Checks&& checks) {
  check_equal(S_OK, CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED), "CoInitializeEx");
  try {
    checks();
  } catch (const std::exception& error) {
    check(false, std::string("ended early: ") + error.what());
  }
  CoUninitialize();
  std::printf("%d passed, %d failed\n", counts.passed, counts.failed);
  return counts.failed == 0 ? 0 : 1;
}

}  // namespace talutil::hosts
