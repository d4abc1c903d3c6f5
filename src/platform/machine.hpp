#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "automation/date.hpp"
#include "automation/text.hpp"

/// What the system information shows of the machine. Sizes are bytes; what the platform does not report is 0 or empty.
namespace talutil {

struct DriveFacts {
  Text name;  ///< "C:"; the folder that it is mounted on where there are no letters.
  Text kind;  ///< "Fixed", "Removable", "Network", "CD-ROM", "RAM disk" or "Unknown".
  Text label;
  Text file_system;  ///< Empty for a drive that is not ready.
  std::uint64_t total = 0;
  std::uint64_t free = 0;
};

struct MemoryFacts {
  std::uint64_t total = 0;
  std::uint64_t available = 0;
  std::uint64_t page_file_total = 0;  ///< Without the memory itself.
  std::uint64_t page_file_available = 0;
};

struct ProcessorFacts {
  Text name;
  Text architecture;
  std::int32_t count = 0;  ///< Logical processors.
  std::int32_t megahertz = 0;
};

struct OperatingSystemFacts {
  Text name;
  Text version;
  Text computer;
  Text user;
  Text folder;               ///< Of the system.
  std::uint64_t uptime = 0;  ///< Seconds.
};

struct ItemFacts {
  bool is_folder = false;
  std::uint64_t size = 0;        ///< 0 for a folder.
  std::uint32_t attributes = 0;  ///< The bits of file_attribute.
  std::optional<Date> created;   ///< Local time, as the others.
  std::optional<Date> modified;
  std::optional<Date> accessed;
};

class Machine {
 public:
  virtual ~Machine() = default;
  [[nodiscard]] virtual std::vector<DriveFacts> drives() = 0;
  [[nodiscard]] virtual MemoryFacts memory() = 0;
  [[nodiscard]] virtual ProcessorFacts processor() = 0;
  [[nodiscard]] virtual OperatingSystemFacts operating_system() = 0;

  /// A file or folder by a path as Files understands it. Raises 53 or 76 for what does not exist.
  [[nodiscard]] virtual ItemFacts item(const Text& path) = 0;
};

}  // namespace talutil
