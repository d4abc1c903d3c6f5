#pragma once

#include "platform/settings.hpp"

namespace talutil::win32 {

/// The system's own profile functions, in their ANSI forms.
class Win32Profiles final : public Profiles {
 public:
  Text value(const Text& file, const Text& section, const Text& item) override;
  Text item_names(const Text& file, const Text& section) override;
  void put(const Text& file, const Text& section, const Text& item, const Text& value) override;
};

/// The user's hive below Software\TALUtil\Settings, a key for the application and one in it for the section.
class Win32SettingsStore final : public SettingsStore {
 public:
  std::optional<Text> value(const Text& application, const Text& section, const Text& key) override;
  void put(const Text& application, const Text& section, const Text& key, const Text& value) override;
};

}  // namespace talutil::win32
