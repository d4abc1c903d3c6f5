#pragma once

#include "automation/boolean.hpp"
#include "automation/text.hpp"
#include "library/library.hpp"

namespace talutil {

class Control;

/// Drives the zip and unzip controls of the components window and explains how it went. The password of the last zip
/// action is kept for the unzip actions that follow.
class ModZipFiles final : public LibraryPart {
 public:
  /// Empties the control's settings, hands it the password, packs, and shows its result.
  void zip(const Control& control, MessageBoxes& boxes, const Text& archive, const Text& items,
           std::int16_t multi_volume, const Text& password);

  /// Empties the control's settings and looks at the archive; extracts only if that went well. Shows the result.
  void unzip(const Control& control, MessageBoxes& boxes, const Text& archive, const Text& destination,
             const Text& items, Boolean overwrite) const;

  /// The explanation of a result code, as users know it; nothing is shown for 0 and below.
  static void show_result(std::int16_t code, MessageBoxes& boxes);

 private:
  Text password_;
};

}  // namespace talutil
