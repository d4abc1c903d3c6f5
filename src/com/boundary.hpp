#pragma once

#include "automation/run_time_error.hpp"
#include "com/floating_point.hpp"
#include "platform/win32/windows.hpp"

/// The boundary between exceptions and automation's results. No exception crosses it.
namespace talutil::com {

/// The HRESULT of a run-time error number: 0x800A0000 plus the number. An HRESULT that came from another object stays
/// as it is.
[[nodiscard]] HRESULT result_of(std::int32_t number) noexcept;

/// The run-time error for the failed result of another object, with the details that it reported. Results for which
/// hosts know a run-time error number become that number. Others are kept and, if the object gave no text, get the
/// system's.
[[nodiscard]] RunTimeError error_of(HRESULT result, TextView description, const ErrorOrigin& reported = {});

/// The error for a failed result of a system function; the caller gets the same HRESULT.
[[nodiscard]] RunTimeError system_error(HRESULT result);

/// Passes the exception being handled to the caller's thread as error information; returns its HRESULT.
[[nodiscard]] HRESULT report_current_exception() noexcept;

/// The same for a late-bound caller.
[[nodiscard]] HRESULT report_current_exception(EXCEPINFO* information) noexcept;

/// Runs a function at the boundary, with the floating-point settings that the library is compiled for.
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
