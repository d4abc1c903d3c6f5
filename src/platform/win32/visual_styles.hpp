#pragma once

#include "platform/win32/windows.hpp"

namespace talutil::win32 {

/// While this exists, windows, boxes and dialogs that are made have the system's controls of version 6, as users of
/// Windows know them, also in hosts without a manifest. A window keeps the activation context that it was made in
/// (documented at "Isolating Components"), so that its own messages need nothing more. Without the manifest in the
/// module's resources or the system's support, they have those of the host.
class VisualStyles {
 public:
  VisualStyles() noexcept;
  VisualStyles(const VisualStyles&) = delete;
  VisualStyles& operator=(const VisualStyles&) = delete;
  ~VisualStyles();

 private:
  bool is_active_ = false;
  ULONG_PTR cookie_ = 0;
};

}  // namespace talutil::win32
