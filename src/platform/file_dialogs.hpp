#pragma once

#include <cstdint>
#include <optional>

#include "automation/text.hpp"

namespace talutil {

/// The flags of a file dialog that hosts use, as bits.
namespace file_dialog_flag {
constexpr std::int32_t overwrite_prompt = 0x2;
constexpr std::int32_t hide_read_only = 0x4;
constexpr std::int32_t path_must_exist = 0x800;
constexpr std::int32_t file_must_exist = 0x1000;
}  // namespace file_dialog_flag

/// The settings of a file dialog.
struct FileDialog {
  enum class Purpose : std::uint8_t { open, save };

  Purpose purpose = Purpose::open;
  Text title;
  Text folder;  ///< The initial folder; empty for the platform's choice.
  Text file_name;
  Text filter;                    ///< Alternating names and patterns, separated by "|".
  std::int32_t filter_index = 0;  ///< The filter selected at first, counted from 1.
  Text default_extension;         ///< Appended to a name without an extension; has no full stop itself.
  std::int32_t flags = 0;
};

struct ChosenFile {
  Text path;
  std::int32_t filter_index = 0;
};

class FileDialogs {
 public:
  virtual ~FileDialogs() = default;

  /// Lets the user choose one file. Returns nothing if the dialog is cancelled or there is nobody to ask. Raises 52 if
  /// the dialog cannot start with the given file name.
  [[nodiscard]] virtual std::optional<ChosenFile> choose(const FileDialog& dialog) = 0;
};

}  // namespace talutil
