#pragma once

#include "platform/folders.hpp"

namespace talutil::win32 {

class Win32Folders final : public Folders {
 public:
  [[nodiscard]] std::unique_ptr<Folder> open(const Text& path) override;
  [[nodiscard]] bool ignores_case() const noexcept override { return true; }
};

}  // namespace talutil::win32
