#pragma once

#include "platform/guids.hpp"

namespace talutil::posix {

/// Random GUIDs (version 4), like those of the Windows platform.
class PosixGuids final : public Guids {
 public:
  /// Raises 51 if the system cannot supply random bits.
  Text make() override;
};

}  // namespace talutil::posix
