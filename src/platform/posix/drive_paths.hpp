#pragma once

#include <string>

#include "automation/text.hpp"

namespace talutil::posix {

/// Where Windows paths lie here. Drive X: is the folder "x" below the drives root, Z: is "/"; the root is named by
/// TALUTIL_DRIVES, else it is "talutil/drives" in the user's data folder. Paths without a drive work as they are.
/// Names are found without regard to case, an exact one first, and without their trailing dots and blanks.
class DrivePaths {
 public:
  DrivePaths();

  /// The native path. What does not exist yet keeps its spelling; ".." never leaves a drive. Raises 76 for a drive
  /// that is missing, and for a network path.
  [[nodiscard]] std::string native(TextView path) const;

  /// As Files::current_folder.
  [[nodiscard]] Text current_folder(TextView drive) const;

  /// Makes the folder of drive C:, which every machine has, when a path lies on it.
  void provide_drive_of(TextView path) const;

 private:
  struct Place {
    std::string base;  ///< Without a separator at its end: "" for "/".
    TextView rest;
  };

  [[nodiscard]] std::string folder_of(char16_t letter) const;
  [[nodiscard]] char16_t current_drive() const;
  [[nodiscard]] Place place_of(TextView path) const;

  std::string root_;
};

}  // namespace talutil::posix
