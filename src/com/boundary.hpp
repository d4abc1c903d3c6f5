#pragma once

#include "automation/run_time_error.hpp"
#include "com/floating_point.hpp"
#include "platform/win32/windows.hpp"

/// The edge between exceptions and automation's results. No exception crosses it.
namespace talutil::com {

/// The HRESULT of a run-time number: 0x800A0000 and the number. What came from another object as an HRESULT
/// stays what it was.
[[nodiscard]] HRESULT result_of(std::int32_t number) noexcept;

/// A run-time error from the failed result of another object, with what it reported. Results that hosts know by a
/// run-time number become that number; others stay what they are and, where the object gave no text, have the system's.
[[nodiscard]] RunTimeError error_of(HRESULT result, TextView description, const ErrorOrigin& reported = {});

/// The failed result of a function of the system's, which leaves the library as it came.
[[nodiscard]] RunTimeError system_error(HRESULT result);

/// Hands the exception being handled to the caller's thread as error information, and gives its HRESULT.
[[nodiscard]] HRESULT report_current_exception() noexcept;

/// The same as a late-bound caller takes it.
[[nodiscard]] HRESULT report_current_exception(EXCEPINFO* information) noexcept;

/// Runs a function at the boundary, with the floating-point settings that it is compiled for.
template <class Function>
[[nodiscard]] HRESULT guarded(Function&& function) noexcept {
  const FloatingPointSettings settings;
  try {
    function();
    return S_OK;
  } catch (...) {
    return report_current_exception();
  }
}

}  // namespace talutil::com
