#pragma once

#include "platform/machine.hpp"
#include "platform/posix/drive_paths.hpp"

namespace talutil::posix {

/// Reads /proc and uses system calls.
class PosixMachine final : public Machine {
 public:
  [[nodiscard]] std::vector<DriveFacts> drives() override;
  [[nodiscard]] MemoryFacts memory() override;
  [[nodiscard]] ProcessorFacts processor() override;
  [[nodiscard]] OperatingSystemFacts operating_system() override;
  [[nodiscard]] ItemFacts item(const Text& path) override;

 private:
  DrivePaths paths_;
};

}  // namespace talutil::posix
