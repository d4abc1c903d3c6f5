#pragma once

#include "platform/folder_picker.hpp"

namespace talutil::posix {

/// Asks at the terminal; without one, the answer is that of a closed dialog.
class PosixFolderPicker final : public FolderPicker {
 public:
  std::optional<Text> choose(TextView title, std::intptr_t owner) override;
};

}  // namespace talutil::posix
