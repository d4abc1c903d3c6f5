#pragma once

#include "platform/machine.hpp"

namespace talutil::win32 {

class Win32Machine final : public Machine {
 public:
  [[nodiscard]] std::vector<DriveFacts> drives() override;
  [[nodiscard]] MemoryFacts memory() override;
  [[nodiscard]] ProcessorFacts processor() override;
  [[nodiscard]] OperatingSystemFacts operating_system() override;
  [[nodiscard]] ItemFacts item(const Text& path) override;
};

}  // namespace talutil::win32
