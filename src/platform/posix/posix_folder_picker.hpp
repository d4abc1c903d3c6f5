#pragma once

#include "platform/folder_picker.hpp"

namespace talutil::posix {

/// Asks at the terminal; without one, behaves like a dialog that was cancelled.
class PosixFolderPicker final : public FolderPicker {
 public:
  std::optional<Text> choose(TextView title, std::intptr_t owner) override;
};

}  // namespace talutil::posix
