#pragma once

#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "automation/member_table.hpp"

namespace talutil::cli {

/// A member with all its slots: a property has one per access.
struct Entry {
  const Member* get = nullptr;
  const Member* put = nullptr;
  const Member* call = nullptr;

  /// The slot that supplies name, help and type.
  [[nodiscard]] const Member& any() const noexcept { return call != nullptr ? *call : get != nullptr ? *get : *put; }
  [[nodiscard]] bool is_method() const noexcept { return call != nullptr; }

  /// The type of a property's value, or of a method's result.
  [[nodiscard]] ValueType type() const noexcept {
    return get == nullptr && put != nullptr ? put->parameters().back().type : any().result;
  }
};

/// The members in the order of their first slots.
[[nodiscard]] std::vector<Entry> entries_of(std::span<const Member> members);

/// Finds a member by name, ignoring case. An unknown name is a usage error that lists the nearest names.
[[nodiscard]] Entry find_entry(std::span<const Member> members, std::string_view name);

/// A type as hosts declare it.
[[nodiscard]] std::string_view type_name(ValueType type) noexcept;

/// The parameters of a method, or the indexes of a property.
[[nodiscard]] std::span<const Parameter> parameters_of(const Entry& entry) noexcept;

/// One of "get put", "get", "put" and "call".
[[nodiscard]] std::string access_words(const Entry& entry);

/// For example "GetData(sSrcStr As String, iSt As Long, iEn As Long) As String". ByRef marks what is written back.
[[nodiscard]] std::string signature(const Entry& entry);

/// The default of an optional parameter as written in a program; otherwise empty.
[[nodiscard]] std::string default_words(const Parameter& parameter);

}  // namespace talutil::cli
