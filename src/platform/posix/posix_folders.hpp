#pragma once

#include "platform/folders.hpp"
#include "platform/posix/drive_paths.hpp"

namespace talutil::posix {

class PosixFolders final : public Folders {
 public:
  [[nodiscard]] std::unique_ptr<Folder> open(const Text& path) override;
  [[nodiscard]] bool ignores_case() const noexcept override { return false; }

 private:
  DrivePaths paths_;
};

}  // namespace talutil::posix
