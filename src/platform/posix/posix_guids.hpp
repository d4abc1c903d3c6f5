#pragma once

#include "platform/guids.hpp"

namespace talutil::posix {

/// GUIDs of random bits, marked as such (version 4), as the Windows platform makes them.
class PosixGuids final : public Guids {
 public:
  /// Raises 51 where the system has no random bits to give.
  Text make() override;
};

}  // namespace talutil::posix
