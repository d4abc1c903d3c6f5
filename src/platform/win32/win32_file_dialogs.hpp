#pragma once

#include "platform/file_dialogs.hpp"

namespace talutil::win32 {

/// The platform's common dialogs. The current folder stays what it was.
class Win32FileDialogs final : public FileDialogs {
 public:
  [[nodiscard]] std::optional<ChosenFile> choose(const FileDialog& dialog) override;
};

}  // namespace talutil::win32
