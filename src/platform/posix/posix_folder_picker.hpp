#pragma once

#include "platform/folder_picker.hpp"
#include "platform/posix/terminal.hpp"

namespace talutil::posix {

/// Asks at the terminal; without one, behaves like a dialog that was cancelled.
class PosixFolderPicker final : public FolderPicker {
 public:
  explicit PosixFolderPicker(const Terminal& terminal) noexcept : terminal_(terminal) {}

  std::optional<Text> choose(TextView title, std::intptr_t owner) override;

 private:
  const Terminal& terminal_;
};

}  // namespace talutil::posix
