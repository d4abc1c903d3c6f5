#pragma once

#include "platform/folder_picker.hpp"

namespace talutil::win32 {

/// The shell's dialog. Raises 53 if the system lacks it.
class Win32FolderPicker final : public FolderPicker {
 public:
  std::optional<Text> choose(TextView title, std::intptr_t owner) override;
};

}  // namespace talutil::win32
