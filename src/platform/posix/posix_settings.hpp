#pragma once

#include <optional>
#include <vector>

#include "automation/run_time_error.hpp"
#include "platform/posix/hive.hpp"
#include "platform/posix/posix_files.hpp"
#include "platform/settings.hpp"

namespace talutil::posix {

/// Profile files, read and written by ProfileDocument. A write is atomic and locks the folder, so that processes do not
/// undo each other's changes.
class PosixProfiles final : public Profiles {
 public:
  explicit PosixProfiles(PosixFiles& files) : files_(files) {}

  Text value(const Text& file, const Text& section, const Text& item) override;
  Text item_names(const Text& file, const Text& section) override;
  void put(const Text& file, const Text& section, const Text& item, const Text& value) override;

  /// Why the last write failed, which `put` does not report; nothing if it was done.
  [[nodiscard]] const std::optional<RunTimeError>& failure() const noexcept { return failure_; }

 private:
  void write(const Text& file, const Text& section, const Text& item, const Text& value);

  PosixFiles& files_;
  std::optional<RunTimeError> failure_;
};

/// The settings, kept in the hive under the same key as in a real registry.
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

  /// Removes a setting; returns whether there was one.
  bool remove(const Text& application, const Text& section, const Text& key);

  /// All settings of an application, by section and key.
  [[nodiscard]] std::vector<Setting> settings_of(const Text& application);

 private:
  Hive& hive_;
};

}  // namespace talutil::posix
