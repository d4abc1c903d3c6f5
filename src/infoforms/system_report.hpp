#pragma once

#include <span>
#include <vector>

#include "platform/platform.hpp"

/// The system information as tables of texts, for its window and for the command.
namespace talutil {

struct FactTable {
  TextView title;
  std::vector<TextView> columns;
  std::vector<std::vector<Text>> rows;
};

/// What lies in a folder, with all that is below it.
struct FolderCount {
  std::uint64_t files = 0;
  std::uint64_t folders = 0;
  std::uint64_t size = 0;   ///< Bytes of all files.
  bool is_complete = true;  ///< False where some of it cannot be read, or there is too much of it.
};

/// The last column of the drives is how full they are, in percent.
[[nodiscard]] FactTable drive_table(Machine& machine);
[[nodiscard]] FactTable memory_table(Machine& machine);
[[nodiscard]] FactTable processor_table(Machine& machine);
[[nodiscard]] FactTable operating_system_table(Machine& machine);

/// A file or folder. Raises as Machine::item does.
[[nodiscard]] FactTable item_table(const Platform& platform, const Text& path);

/// Links are not followed; counting ends at a hundred thousand entries.
[[nodiscard]] FolderCount count_folder(Folders& folders, const Text& path);

/// "read-only, hidden"; "none".
[[nodiscard]] Text attribute_words(std::uint32_t attributes);

/// "465.8 GB"; bytes below 1024 as "12 bytes".
[[nodiscard]] Text size_words(std::uint64_t bytes);

/// The tables below one another in columns of equal width, for the clipboard and the terminal.
[[nodiscard]] Text as_text(std::span<const FactTable> tables);

}  // namespace talutil
