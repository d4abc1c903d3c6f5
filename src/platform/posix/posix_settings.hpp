#pragma once

#include <vector>

#include "platform/posix/hive.hpp"
#include "platform/posix/posix_files.hpp"
#include "platform/settings.hpp"

namespace talutil::posix {

/// Profile files read and written by ProfileDocument. A write takes effect whole, under a lock of the folder, so that
/// those of several processes do not undo one another.
class PosixProfiles final : public Profiles {
 public:
  explicit PosixProfiles(PosixFiles& files) : files_(files) {}

  Text value(const Text& file, const Text& section, const Text& item) override;
  Text item_names(const Text& file, const Text& section) override;
  void put(const Text& file, const Text& section, const Text& item, const Text& value) override;

 private:
  PosixFiles& files_;
};

/// The settings in the hive, where the platform with a registry has them too.
class PosixSettingsStore final : public SettingsStore {
 public:
  struct Setting {
    Text section;
    Text key;
    Text value;
  };

  explicit PosixSettingsStore(Hive& hive) : hive_(hive) {}

  std::optional<Text> value(const Text& application, const Text& section, const Text& key) override;
  void put(const Text& application, const Text& section, const Text& key, const Text& value) override;

  /// All settings of an application, by section and key.
  [[nodiscard]] std::vector<Setting> settings_of(const Text& application);

 private:
  Hive& hive_;
};

}  // namespace talutil::posix
