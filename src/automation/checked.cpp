#include "automation/checked.hpp"

namespace talutil {

// Avoids the mathematics library's rounding functions, which depend on a processor mode that hosts change.
template <std::signed_integral To>
To round_to(double value) {
  using Limits = std::numeric_limits<To>;
  if (!(value > Limits::min() - 1.0 && value < Limits::max() + 1.0)) raise(ErrorNumber::overflow);
  auto whole = static_cast<std::int64_t>(value);
  const double rest = value - static_cast<double>(whole);
  const bool is_odd = whole % 2 != 0;
  if (rest > 0.5 || (rest == 0.5 && is_odd)) ++whole;
  if (rest < -0.5 || (rest == -0.5 && is_odd)) --whole;
  return checked_cast<To>(whole);
}

template std::int16_t round_to<std::int16_t>(double);
template std::int32_t round_to<std::int32_t>(double);

}  // namespace talutil
