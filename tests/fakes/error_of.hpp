#pragma once

#include <cstdint>
#include <utility>

#include "automation/run_time_error.hpp"

namespace talutil::testing {

/// The number of the run-time error that leaves a call; 0 when there is none.
template <class Call>
std::int32_t error_of(Call&& call) {
  try {
    std::forward<Call>(call)();
  } catch (const RunTimeError& error) {
    return error.number();
  }
  return 0;
}

}  // namespace talutil::testing
