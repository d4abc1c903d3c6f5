#pragma once

#include <cstdint>
#include <string>
#include <utility>

#include "automation/run_time_error.hpp"
#include "automation/variant.hpp"

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

/// What a call gives, as text that a table can hold: its value, "none" for an empty optional, "error 6".
template <class Call>
std::string outcome(const Call& call) {
  constexpr auto shown = [](const auto& value) { return to_utf8(Variant(value).to_text(plain_numbers)); };
  std::string result;
  const std::int32_t error = error_of([&] {
    const auto value = call();
    if constexpr (requires { value.has_value(); })
      result = value ? shown(*value) : "none";
    else
      result = shown(value);
  });
  return error == 0 ? result : "error " + std::to_string(error);
}

}  // namespace talutil::testing
