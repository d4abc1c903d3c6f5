#pragma once

#include "platform/file_dialogs.hpp"

namespace talutil::win32 {

/// The platform's common dialogs. They do not change the current folder.
class Win32FileDialogs final : public FileDialogs {
 public:
  [[nodiscard]] std::optional<ChosenFile> choose(const FileDialog& dialog) override;
};

}  // namespace talutil::win32
