#pragma once

#include <functional>
#include <span>
#include <vector>

#include "platform/platform.hpp"

/// The system information as tables of texts, for the window and for the command.
namespace talutil {

struct FactTable {
  TextView title;
  std::vector<TextView> columns;
  std::vector<std::vector<Text>> rows;
};

/// The contents of a folder, including everything below it.
struct FolderCount {
  std::uint64_t files = 0;
  std::uint64_t folders = 0;
  std::uint64_t size = 0;   ///< Bytes of all files.
  bool is_complete = true;  ///< False if part of it cannot be read or it has too many entries.
};

/// The last column shows how full each drive is, in percent.
[[nodiscard]] FactTable drive_table(Machine& machine);
[[nodiscard]] FactTable memory_table(Machine& machine);
[[nodiscard]] FactTable processor_table(Machine& machine);
[[nodiscard]] FactTable operating_system_table(Machine& machine);

/// A file or folder. While a folder is counted, there is an hourglass, and its user may give up: then the numbers are
/// "at least" what was found. Raises the same errors as Machine::item.
[[nodiscard]] FactTable item_table(const Platform& platform, const Text& path);

/// Links are not followed; counting stops at a hundred thousand entries, or when `is_given_up` says so.
[[nodiscard]] FolderCount count_folder(Folders& folders, const Text& path,
                                       const std::function<bool()>& is_given_up = nullptr);

/// For example "read-only, hidden", or "none".
[[nodiscard]] Text attribute_words(std::uint32_t attributes);

/// For example "465.8 GB"; below 1024 bytes, "12 bytes".
[[nodiscard]] Text size_words(std::uint64_t bytes);

/// The tables one below the other, with aligned columns, for the clipboard and the terminal.
[[nodiscard]] Text as_text(std::span<const FactTable> tables);

}  // namespace talutil
