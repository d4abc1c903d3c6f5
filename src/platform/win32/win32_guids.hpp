#pragma once

#include "platform/guids.hpp"

namespace talutil::win32 {

class Win32Guids final : public Guids {
 public:
  /// Raises 51 when the system makes none.
  Text make() override;
};

}  // namespace talutil::win32
