#pragma once

#include "platform/file_dialogs.hpp"
#include "platform/posix/terminal.hpp"

namespace talutil::posix {

/// Asks for the file at the terminal.
class PosixFileDialogs final : public FileDialogs {
 public:
  explicit PosixFileDialogs(const Terminal& terminal) noexcept : terminal_(terminal) {}

  [[nodiscard]] std::optional<ChosenFile> choose(const FileDialog& dialog) override;

 private:
  const Terminal& terminal_;
};

}  // namespace talutil::posix
