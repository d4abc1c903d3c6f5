#pragma once

#include <cstdint>
#include <span>
#include <string_view>

/// The texts of the classes that hosts create and of their members: the doc comments at their declarations, which
/// tools/member_texts.py turns into tables when the command or the type library is built. The DLL does not contain
/// them.
namespace talutil::texts {

struct NamedText {
  std::string_view name;
  std::string_view text;
};

struct RaisedError {
  std::int32_t number = 0;
  std::string_view when;
};

/// Statements that are VBScript as well as VBA; comments below a Print are what it prints.
struct Example {
  std::string_view title;
  std::string_view code;
  bool shows_window = false;
};

/// References are full names: "Member" of ORVUtils, "Class.Member" of the others.
struct MemberText {
  std::string_view name;
  std::string_view summary;  ///< One sentence: the help string.
  std::string_view details;  ///< Further paragraphs, separated by empty lines; may be empty.
  std::string_view family;
  std::span<const NamedText> parameters;
  std::span<const RaisedError> errors;
  std::span<const std::string_view> reads;  ///< Settings, and properties of the same class, that it reads.
  std::span<const std::string_view> changes;
  std::span<const std::string_view> see;  ///< Classes, members and pages ("docs/dates.md").
  std::span<const Example> examples;
};

struct ClassText {
  MemberText text;  ///< Of the class itself; it has no parameters.
  std::span<const MemberText> members;
};

/// The classes in the order in which identity.hpp has them.
[[nodiscard]] std::span<const ClassText> all_classes() noexcept;

/// The families of members in the order of the reference.
[[nodiscard]] std::span<const std::string_view> families() noexcept;

/// The texts of a class, which must be one of those above.
[[nodiscard]] const ClassText& text_of(std::string_view class_name);

/// The text of a member that the class has.
[[nodiscard]] const MemberText& text_of(const ClassText& owner, std::string_view member);

}  // namespace talutil::texts
