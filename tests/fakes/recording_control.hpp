#pragma once

#include <algorithm>
#include <functional>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "automation/run_time_error.hpp"
#include "automation/variant.hpp"
#include "tests/fakes/host_members.hpp"

namespace talutil::testing {

/// A value with its type, as transcripts show it: "abc", 1% (16 bits), 1& (32), 1! (single), 1# (double), True.
inline std::string shown(const Variant& value) {
  using Kind = Variant::Kind;
  if (value.is(Kind::null)) return "Null";
  if (value.is(Kind::empty)) return "Empty";
  if (value.is(Kind::object)) return "an object";
  const std::string text = to_utf8(value.to_text(plain_numbers));
  if (value.is(Kind::text)) return '"' + text + '"';
  static const std::map<Kind, const char*> marks = {
      {Kind::int16, "%"}, {Kind::int32, "&"}, {Kind::single, "!"}, {Kind::double_, "#"}};
  const auto mark = marks.find(value.kind());
  return mark == marks.end() ? text : text + mark->second;
}

/// A control of a host: it answers with the values it is given and notes how it is used. A member is there when it has
/// a value, "Name" or "Name(1&)" with indexes, or is among the methods, which answer with nothing; it is used as
/// `uses_of` says, or not at all.
class RecordingControl : public Object {
 public:
  std::map<std::string, Variant> values;
  std::vector<std::string> methods;
  std::vector<std::string> uses;
  std::vector<std::string> look_ups;
  std::function<void(const std::string& use)> before;  ///< Called before each use, and may throw.

  /// The uses since the last time, with bars between them.
  std::string taken_uses() {
    std::string all;
    for (const std::string& use : std::exchange(uses, {})) all += (all.empty() ? "" : "|") + use;
    return all;
  }

  std::int32_t member_id(TextView name) override {
    const std::string member = to_utf8(name);
    look_ups.push_back(member);
    const auto found = std::ranges::find(names_, member);
    if (found != names_.end()) return static_cast<std::int32_t>(found - names_.begin()) + 1;
    const auto is_named = [&](const auto& entry) { return entry.first.substr(0, entry.first.find('(')) == member; };
    const bool is_there = std::ranges::any_of(values, is_named) || std::ranges::find(methods, member) != methods.end();
    if (!is_there) raise(ErrorNumber::member_not_supported);
    names_.push_back(member);
    return static_cast<std::int32_t>(names_.size());
  }

  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override {
    const std::size_t indexes = arguments.size() - (access == Access::put ? 1 : 0);
    const auto index = static_cast<std::size_t>(member) - 1;  // Past the end for the default member, which is 0.
    std::string name = index < names_.size() ? names_[index] : '#' + std::to_string(member);
    // Members that have a number alone are properties, there when they have a value.
    const bool is_named = index < names_.size();
    const unsigned declared = is_named ? uses_of(name) : access == Access::put || values.contains(name) ? property : 0;
    if ((declared & wanted(access, arguments)) == 0) raise(ErrorNumber::member_not_supported);
    for (std::size_t i = 0; i < indexes; ++i) name += (i == 0 ? "(" : ", ") + shown(arguments[i]);
    if (indexes > 0) name += ')';
    std::string use = name;
    if (access == Access::put) use = "put " + name + " = " + shown(arguments.back());
    if (access == Access::call) use = "call " + name;
    uses.push_back(use);
    if (before) before(use);
    if (access == Access::put) {
      values[name] = arguments.back();
      return {};
    }
    if (const auto found = values.find(name); found != values.end()) return found->second;
    if (access == Access::call) return {};
    raise(ErrorNumber::subscript_out_of_range);
  }

 private:
  static unsigned wanted(Access access, std::span<const Variant> arguments) {
    if (access == Access::call) return function;
    if (access == Access::get) return function | readable;
    return arguments.back().is(Variant::Kind::object) ? writable | set_by_reference : writable;
  }

  std::vector<std::string> names_;
};

}  // namespace talutil::testing
