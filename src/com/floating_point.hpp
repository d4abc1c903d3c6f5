#pragma once

#include <xmmintrin.h>

#include <cstdint>

namespace talutil::com {

/// Sets the processor's floating-point settings to those the library is compiled for, for the duration of a call: all
/// exceptions masked, rounding to nearest, 53 bits in the x87 unit. Some compilers' hosts unmask exceptions, so that a
/// NaN in an argument would terminate them; graphics libraries leave the unit at 24 bits, with which the run time's
/// conversions of numbers produce other digits. The destructor restores the caller's settings.
class FloatingPointSettings {
 public:
  FloatingPointSettings() noexcept : control_(control()), sse_control_(_mm_getcsr()) {
    if (control_ != standard_control) set_control(standard_control);
    if ((sse_control_ & ~sse_flags) != standard_sse_control) _mm_setcsr(standard_sse_control);
  }
  FloatingPointSettings(const FloatingPointSettings&) = delete;
  FloatingPointSettings& operator=(const FloatingPointSettings&) = delete;
  ~FloatingPointSettings() {
    if (control_ != standard_control) {
      // Otherwise exceptions raised while masked would be reported at the next instruction of a caller that wants them.
      if ((control_ & exception_masks) != exception_masks) __asm__ volatile("fnclex");
      set_control(control_);
    }
    if ((sse_control_ & ~sse_flags) != standard_sse_control) _mm_setcsr(sse_control_);
  }

 private:
  // The values with which the system starts every thread.
  static constexpr std::uint16_t standard_control = 0x027F;
  static constexpr std::uint16_t exception_masks = 0x3F;
  static constexpr std::uint32_t standard_sse_control = 0x1F80;
  static constexpr std::uint32_t sse_flags = 0x3F;  ///< Status flags rather than settings.

  static std::uint16_t control() noexcept {
    std::uint16_t value = 0;
    __asm__ volatile("fnstcw %0" : "=m"(value));
    return value;
  }
  static void set_control(std::uint16_t value) noexcept { __asm__ volatile("fldcw %0" : : "m"(value)); }

  std::uint16_t control_;
  std::uint32_t sse_control_;
};

}  // namespace talutil::com
