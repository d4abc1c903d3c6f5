#pragma once

#include "platform/file_dialogs.hpp"

namespace talutil::posix {

/// Asks for the file at the terminal.
class PosixFileDialogs final : public FileDialogs {
 public:
  [[nodiscard]] std::optional<ChosenFile> choose(const FileDialog& dialog) override;
};

}  // namespace talutil::posix
