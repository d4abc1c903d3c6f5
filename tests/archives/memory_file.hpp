#pragma once

#include <string>

#include "platform/folders.hpp"

namespace talutil::archives::testing {

class MemoryFile final : public StoredFile {
 public:
  explicit MemoryFile(std::string bytes) : bytes_(std::move(bytes)) {}
  [[nodiscard]] std::uint64_t size() const noexcept override { return bytes_.size(); }
  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    if (offset >= bytes_.size()) return 0;
    return bytes_.copy(buffer.data(), buffer.size(), static_cast<std::size_t>(offset));
  }

 private:
  std::string bytes_;
};

}  // namespace talutil::archives::testing
