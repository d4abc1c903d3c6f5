#pragma once

#include <optional>

#include "automation/text.hpp"

namespace talutil {

/// The platform's profile files: sections in brackets, lines of item=value, texts in code page 1252.
class Profiles {
 public:
  /// What one read gives at most: its buffer of 1024 characters ends with a NUL.
  static constexpr std::size_t longest_value = 1023;

  virtual ~Profiles() = default;

  /// The value of an item; empty when there is none, or no such file. Section and item are found without case, blanks
  /// around them do not count. Quotes around a value are dropped.
  [[nodiscard]] virtual Text value(const Text& file, const Text& section, const Text& item) = 0;

  /// The names of a section's items in their order, each followed by a NUL.
  [[nodiscard]] virtual Text item_names(const Text& file, const Text& section) = 0;

  /// Puts a value in the place of the item's, or adds the item at the end of its section, or both at the end of the
  /// file. A failure is not reported.
  virtual void put(const Text& file, const Text& section, const Text& item, const Text& value) = 0;
};

/// The user's own settings: texts by application, section and key, found without case. A backslash in an application or
/// section parts nested keys.
class SettingsStore {
 public:
  virtual ~SettingsStore() = default;

  /// Empty when there is none. Raises an error that says what is wrong with the store when it cannot be read.
  [[nodiscard]] virtual std::optional<Text> value(const Text& application, const Text& section, const Text& key) = 0;

  /// Raises an error that says what is wrong with the store when it cannot be written.
  virtual void put(const Text& application, const Text& section, const Text& key, const Text& value) = 0;
};

}  // namespace talutil
