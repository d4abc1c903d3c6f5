#pragma once

#include <cstdint>
#include <optional>

#include "automation/text.hpp"

namespace talutil {

/// The flags of a file dialog that hosts know, as bits.
namespace file_dialog_flag {
constexpr std::int32_t overwrite_prompt = 0x2;
constexpr std::int32_t hide_read_only = 0x4;
constexpr std::int32_t path_must_exist = 0x800;
constexpr std::int32_t file_must_exist = 0x1000;
}  // namespace file_dialog_flag

/// What a file dialog is set up with.
struct FileDialog {
  enum class Purpose : std::uint8_t { open, save };

  Purpose purpose = Purpose::open;
  Text title;
  Text folder;  ///< Where it starts; empty for the platform's choice.
  Text file_name;
  Text filter;                    ///< Names and patterns in turn, with a bar between them.
  std::int32_t filter_index = 0;  ///< The filter that is chosen first, counted from 1.
  Text default_extension;         ///< Added to a name without one; without its full stop.
  std::int32_t flags = 0;
};

struct ChosenFile {
  Text path;
  std::int32_t filter_index = 0;
};

class FileDialogs {
 public:
  virtual ~FileDialogs() = default;

  /// Lets the user choose one file; nothing when the dialog was closed, or where there is nobody to ask. Raises 52 for
  /// a file name that the dialog cannot start with.
  [[nodiscard]] virtual std::optional<ChosenFile> choose(const FileDialog& dialog) = 0;
};

}  // namespace talutil
