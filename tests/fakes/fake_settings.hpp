#pragma once

#include <map>
#include <tuple>
#include <vector>

#include "automation/run_time_error.hpp"
#include "platform/profile_document.hpp"
#include "platform/settings.hpp"

namespace talutil::testing {

/// Profile files in memory.
struct FakeProfiles final : Profiles {
  std::map<Text, ProfileDocument> files;

  Text value(const Text& file, const Text& section, const Text& item) override {
    const auto found = files.find(file);
    return found == files.end() ? Text() : found->second.value(section, item).value_or(Text()).substr(0, longest_value);
  }

  Text item_names(const Text& file, const Text& section) override {
    Text names;
    const auto found = files.find(file);
    if (found == files.end()) return names;
    for (const Text& name : found->second.item_names(section)) names.append(name).append(1, u'\0');
    return names;
  }

  void put(const Text& file, const Text& section, const Text& item, const Text& value) override {
    files.try_emplace(file, "").first->second.put(section, item, value);
  }
};

/// A user's settings in memory. Each access is noted as "application|section|key", a write with "=value" after it.
struct FakeSettingsStore final : SettingsStore {
  std::map<Text, Text> values;
  std::vector<Text> accesses;
  bool fails = false;

  std::optional<Text> value(const Text& application, const Text& section, const Text& key) override {
    const Text place = note(application, section, key);
    const auto found = values.find(place);
    return found == values.end() ? std::nullopt : std::optional(found->second);
  }

  void put(const Text& application, const Text& section, const Text& key, const Text& value) override {
    values[note(application, section, key)] = value;
    accesses.back() += u"=" + value;
  }

 private:
  Text note(const Text& application, const Text& section, const Text& key) {
    if (fails) raise(ErrorNumber::device_io_error);
    return accesses.emplace_back(application + u"|" + section + u"|" + key);
  }
};

}  // namespace talutil::testing
