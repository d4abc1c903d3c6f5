#pragma once

#include <string>

#include "automation/text.hpp"

namespace talutil::posix {

/// Maps Windows paths to native ones. Drive X: is the folder "x" in the drives root, Z: is "/". The root is
/// TALUTIL_DRIVES or, if that is not set, "talutil/drives" in the user's data folder. Paths without a drive work as
/// they are. Names are found regardless of case (an exact match wins) and of trailing dots and blanks.
class DrivePaths {
 public:
  DrivePaths();

  /// The native path. Parts that do not exist keep their spelling; ".." never leaves a drive. Raises 76 for a missing
  /// drive and for a network path.
  [[nodiscard]] std::string native(TextView path) const;

  /// See Files::current_folder.
  [[nodiscard]] Text current_folder(TextView drive) const;

  /// Creates the folder of drive C:, which every machine has, if the path is on that drive.
  void provide_drive_of(TextView path) const;

 private:
  struct Place {
    std::string base;  ///< Without a trailing separator: "" for "/".
    TextView rest;
  };

  [[nodiscard]] std::string folder_of(char16_t letter) const;
  [[nodiscard]] char16_t current_drive() const;
  [[nodiscard]] Place place_of(TextView path) const;

  std::string root_;
};

}  // namespace talutil::posix
