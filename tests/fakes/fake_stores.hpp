#pragma once

#include <algorithm>
#include <array>
#include <map>
#include <vector>

#include "automation/run_time_error.hpp"
#include "platform/network.hpp"
#include "platform/profile_document.hpp"
#include "platform/registry.hpp"
#include "platform/settings.hpp"

namespace talutil::testing {

/// A registry of keys by path, whatever their root. Only keys that exist can be opened.
struct FakeRegistry final : Registry {
  struct Value {
    std::uint32_t type = 0;
    std::string data;
  };

  std::map<Text, std::map<Text, Value>> keys;
  std::vector<Text> calls;  ///< "open 1 path", "create 80000002 path" and "close", with access or root in hexadecimal.
  std::map<Handle, Text> opened;
  Handle next = 100;

  std::int32_t open(Handle /*root*/, const Text& path, std::uint32_t access, Handle& key) override {
    calls.reserve(calls.size() + 2);  // For "close", which cannot fail, too.
    calls.push_back(u"open " + Text(1, static_cast<char16_t>(u'0' + access)) + u" " + path);
    if (!keys.contains(path)) return not_found;
    opened[key = next++] = path;
    return ok;
  }
  std::int32_t create(Handle root, const Text& path, Handle& key) override {
    calls.reserve(calls.size() + 2);
    calls.push_back(Text(u"create ") + (root == current_user ? u"user " : u"other ") + path);
    keys[path];
    opened[key = next++] = path;
    return ok;
  }
  void close(Handle key) noexcept override {
    calls.push_back(u"close");
    opened.erase(key);
  }
  std::int32_t query(Handle key, const Text& name, std::uint32_t& type, std::uint32_t& size,
                     std::span<char> buffer) override {
    if (!opened.contains(key)) return invalid_handle;
    const auto& values = keys.at(opened.at(key));
    const auto value = values.find(name);
    if (value == values.end()) return not_found;
    type = value->second.type;
    size = static_cast<std::uint32_t>(value->second.data.size());
    if (buffer.empty()) return ok;
    if (buffer.size() < size) return more_data;
    std::ranges::copy(value->second.data, buffer.begin());
    return ok;
  }
  std::int32_t set(Handle key, const Text& name, std::uint32_t type, std::string_view data) override {
    if (!opened.contains(key)) return invalid_handle;
    keys.at(opened.at(key))[name] = {type, std::string(data)};
    return ok;
  }
};

/// The addresses of a machine, in ascending order.
struct FakeNetwork final : Network {
  std::vector<std::array<std::uint8_t, 4>> addresses;

  void read_address_table(std::span<std::uint8_t> buffer) override {
    constexpr std::size_t row_size = 24;
    if (4 + addresses.size() * row_size > buffer.size()) return;
    buffer[0] = static_cast<std::uint8_t>(addresses.size());
    for (std::size_t i = 0; i < addresses.size(); ++i) {
      std::ranges::copy(addresses[i], buffer.begin() + static_cast<std::ptrdiff_t>(4 + i * row_size));
    }
  }
};

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
