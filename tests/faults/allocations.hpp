#pragma once

#include <cstddef>

namespace talutil::testing {

/// Lets one allocation of this program fail, by number from 0.
class FailingAllocation {
 public:
  explicit FailingAllocation(std::size_t number) noexcept;
  FailingAllocation(const FailingAllocation&) = delete;
  FailingAllocation& operator=(const FailingAllocation&) = delete;
  ~FailingAllocation();

  /// Whether there was an allocation with that number.
  [[nodiscard]] static bool is_reached() noexcept;
};

}  // namespace talutil::testing
