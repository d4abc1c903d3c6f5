#pragma once

#include "platform/settings.hpp"

namespace talutil::win32 {

/// The system's profile functions, in their ANSI form.
class Win32Profiles final : public Profiles {
 public:
  Text value(const Text& file, const Text& section, const Text& item) override;
  Text item_names(const Text& file, const Text& section) override;
  void put(const Text& file, const Text& section, const Text& item, const Text& value) override;
};

/// The settings below Software\TALUtil\Settings in the user's hive, with one key per application and one subkey per
/// section.
class Win32SettingsStore final : public SettingsStore {
 public:
  std::optional<Text> value(const Text& application, const Text& section, const Text& key) override;
  void put(const Text& application, const Text& section, const Text& key, const Text& value) override;
};

}  // namespace talutil::win32
