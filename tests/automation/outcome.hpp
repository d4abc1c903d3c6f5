#pragma once

#include <string>

#include "automation/run_time_error.hpp"
#include "automation/variant.hpp"

namespace talutil {

/// What a call gives, as text that a table can hold: its value, "none" for an empty optional, "error 6".
template <class Call>
std::string outcome(const Call& call) {
  constexpr auto shown = [](const auto& value) { return to_utf8(Variant(value).to_text(plain_numbers)); };
  try {
    const auto result = call();
    if constexpr (requires { result.has_value(); })
      return result ? shown(*result) : "none";
    else
      return shown(result);
  } catch (const RunTimeError& error) {
    return "error " + std::to_string(error.number());
  }
}

}  // namespace talutil
