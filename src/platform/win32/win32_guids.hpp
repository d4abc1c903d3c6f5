#pragma once

#include "platform/guids.hpp"

namespace talutil::win32 {

class Win32Guids final : public Guids {
 public:
  /// Raises 51 if the system fails to create one.
  Text make() override;
};

}  // namespace talutil::win32
