#pragma once

#include <cstdint>
#include <optional>
#include <vector>

#include "automation/date.hpp"
#include "automation/text.hpp"

/// What the system information shows about the machine. Sizes are in bytes; anything that the platform does not report
/// is 0 or empty.
namespace talutil {

struct DriveFacts {
  Text name;  ///< "C:"; the mount point where there are no drive letters.
  Text kind;  ///< "Fixed", "Removable", "Network", "CD-ROM", "RAM disk" or "Unknown".
  Text label;
  Text file_system;  ///< Empty if the drive is not ready.
  std::uint64_t total = 0;
  std::uint64_t free = 0;
};

struct MemoryFacts {
  std::uint64_t total = 0;
  std::uint64_t available = 0;
  std::uint64_t page_file_total = 0;  ///< Not including physical memory.
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
  Text folder;               ///< The system folder.
  std::uint64_t uptime = 0;  ///< Seconds.
};

struct ItemFacts {
  bool is_folder = false;
  std::uint64_t size = 0;        ///< 0 for a folder.
  std::uint32_t attributes = 0;  ///< The bits of file_attribute.
  std::optional<Date> created;   ///< All three in local time.
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

  /// A file or folder, by a path as Files interprets it. Raises 53 or 76 if it does not exist.
  [[nodiscard]] virtual ItemFacts item(const Text& path) = 0;
};

}  // namespace talutil
