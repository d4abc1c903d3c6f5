#pragma once

#include <algorithm>
#include <string_view>

/// What the members of a host's controls are. A real control answers a use only where it fits.
namespace talutil::testing {

/// The ways in which a member can be used, in automation's own numbers.
enum MemberUse : unsigned { function = 1, readable = 2, writable = 4, set_by_reference = 8 };

inline constexpr unsigned property = readable | writable;

/// What a member is; most are properties.
constexpr unsigned uses_of(std::string_view name) {
  constexpr std::string_view functions[] = {"ItemData",  "Move",       "Refresh", "ScaleX",   "ScaleY",
                                            "TextWidth", "TextHeight", "Print",   "StartDoc", "EndDoc",
                                            "PrintDoc",  "TextBox",    "NameCase"};
  constexpr std::string_view read_only[] = {"ListCount", "SearchIndex", "hwnd", "hDC", "PageWidth", "PageCount"};
  if (std::ranges::find(functions, name) != std::end(functions)) return function;
  if (std::ranges::find(read_only, name) != std::end(read_only)) return readable;
  if (name == "Action" || name == "RenderControl") return writable;
  if (name == "RenderObject") return set_by_reference;
  return name == "Container" ? readable | set_by_reference : property;
}

}  // namespace talutil::testing
