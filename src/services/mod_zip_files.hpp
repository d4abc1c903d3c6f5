#pragma once

#include "automation/boolean.hpp"
#include "automation/text.hpp"
#include "library/library.hpp"

namespace talutil {

class Control;

/// Drives the zip and unzip controls of the components window and explains the results. The password of the last zip
/// action is kept for the unzip actions that follow.
class ModZipFiles final : public LibraryPart {
 public:
  /// The password of the zip actions that follow, and of the unzip actions after them.
  void set_password(const Text& password) { password_ = password; }

  /// Resets the control's settings, packs, and shows the result.
  void zip(const Control& control, MessageBoxes& boxes, const Text& archive, const Text& items,
           std::int16_t multi_volume) const;

  /// Resets the control's settings and inspects the archive; extracts only if that succeeded. Shows the result.
  void unzip(const Control& control, MessageBoxes& boxes, const Text& archive, const Text& destination,
             const Text& items, Boolean overwrite) const;

  /// Shows the explanation of a result code in the wording that users know; nothing for 0 and below.
  static void show_result(std::int16_t code, MessageBoxes& boxes);

 private:
  Text password_;
};

}  // namespace talutil
