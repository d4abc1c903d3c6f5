#pragma once

#include "controls/table_object.hpp"

namespace talutil {

/// The system information control, as far as the library needs it: the computer's name.
class SystemInformation final : public TableObject<SystemInformation> {
 public:
  explicit SystemInformation(const Platform& platform) : TableObject(platform), computer_(platform.computer) {}

  /// Read on every call.
  [[nodiscard]] Text computer_name() const { return computer_.name(); }

 private:
  Computer& computer_;
};

template <class P>
constexpr auto members_of(std::type_identity<SystemInformation>) {
  // Forms use this identifier rather than the name.
  return P::rows(P::template get_only<&SystemInformation::computer_name>({"ComputerName", 0x68030010}));
}

}  // namespace talutil
