#pragma once

#include <optional>

#include "automation/text.hpp"

namespace talutil {

/// The platform's profile files: sections in brackets, lines of the form item=value, text in the ANSI code page.
class Profiles {
 public:
  /// The longest value that a read returns: its buffer holds 1024 characters including the NUL.
  static constexpr std::size_t longest_value = 1023;

  virtual ~Profiles() = default;

  /// The value of an item; empty if there is no such item or file. Section and item match regardless of case and
  /// surrounding blanks. Quotes around the value are removed.
  [[nodiscard]] virtual Text value(const Text& file, const Text& section, const Text& item) = 0;

  /// The names of a section's items in file order, each followed by a NUL.
  [[nodiscard]] virtual Text item_names(const Text& file, const Text& section) = 0;

  /// Replaces an item's value, or adds the item at the end of its section, or both at the end of the file. Failures are
  /// not reported.
  virtual void put(const Text& file, const Text& section, const Text& item, const Text& value) = 0;
};

/// The user's settings: texts by application, section and key, ignoring case. A backslash in an application or section
/// separates nested keys.
class SettingsStore {
 public:
  virtual ~SettingsStore() = default;

  /// Empty if there is no such setting. If the store cannot be read, raises an error that says why.
  [[nodiscard]] virtual std::optional<Text> value(const Text& application, const Text& section, const Text& key) = 0;

  /// If the store cannot be written, raises an error that says why.
  virtual void put(const Text& application, const Text& section, const Text& key, const Text& value) = 0;
};

}  // namespace talutil
