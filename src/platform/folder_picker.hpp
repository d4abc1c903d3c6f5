#pragma once

#include <cstdint>
#include <optional>

#include "automation/text.hpp"

namespace talutil {

class FolderPicker {
 public:
  virtual ~FolderPicker() = default;

  /// Lets the user choose a folder. Returns nothing if the dialog is cancelled or there is nobody to ask. The title is
  /// ANSI text, the owner the handle of one of the library's windows.
  [[nodiscard]] virtual std::optional<Text> choose(TextView title, std::intptr_t owner) = 0;
};

}  // namespace talutil
