#pragma once

#include <algorithm>
#include <string_view>

/// The members of a host's controls that the library drives, and what each of them is. A real control answers a use
/// only where it fits.
namespace talutil::testing {

/// The ways in which a member can be used, in automation's own numbers.
enum MemberUse : unsigned { function = 1, readable = 2, writable = 4, set_by_reference = 8 };

struct HostMember {
  std::string_view name;
  unsigned uses;
};

inline constexpr unsigned property = readable | writable;

// clang-format off
inline constexpr HostMember host_members[] = {
    // List boxes, combo boxes and those with a search of their own.
    {"Text", property}, {"ListCount", readable}, {"List", property}, {"ItemData", function}, {"ListIndex", property},
    {"SearchText", property}, {"ColumnSearch", property}, {"SearchMethod", property}, {"SearchIndex", readable},
    {"Action", writable},
    // Grids.
    {"Rows", property}, {"Cols", property}, {"FixedRows", property}, {"Row", property}, {"RowSel", property},
    {"ColWidth", property}, {"ColHidden", property}, {"RowHidden", property}, {"ColDataType", property},
    {"TextMatrix", property}, {"Cell", property}, {"FixedCols", property}, {"BackColor", property},
    {"ForeColorFixed", property}, {"BackColorFixed", property}, {"GridColor", property}, {"GridLinesFixed", property},
    {"MergeCells", property}, {"MergeRow", property},
    // Windows and what lies on them.
    {"hwnd", readable}, {"WindowState", property}, {"left", property}, {"Top", property}, {"Width", property},
    {"Height", property}, {"Container", readable | set_by_reference}, {"Move", function}, {"Refresh", function},
    // What can be drawn on.
    {"ScaleWidth", property}, {"ScaleHeight", property}, {"ScaleMode", property}, {"ScaleX", function},
    {"ScaleY", function}, {"TextWidth", function}, {"TextHeight", function}, {"CurrentX", property},
    {"CurrentY", property}, {"FontBold", property}, {"ForeColor", property}, {"hDC", readable}, {"Print", function},
    // Print controls.
    {"HeaderFontName", property}, {"FontName", property}, {"Zoom", property}, {"Duplex", property},
    {"PaperSize", property}, {"Orientation", property}, {"Header", property}, {"RenderControl", writable},
    {"RenderObject", set_by_reference}, {"MarginLeft", property}, {"MarginTop", property}, {"MarginRight", property},
    {"PageWidth", readable}, {"CurrentPage", property}, {"PageCount", readable}, {"StartDoc", function},
    {"EndDoc", function}, {"PrintDoc", function}, {"TextBox", function},
    // Objects that stand for records, and converters of names.
    {"wYear", property}, {"wMonth", property}, {"wDayOfWeek", property}, {"wDay", property}, {"wHour", property},
    {"wMinute", property}, {"wSecond", property}, {"wMilliseconds", property}, {"NameCase", function},
};
// clang-format on

/// What a member is; 0 for a name that no control has.
constexpr unsigned uses_of(std::string_view name) {
  const auto* const found = std::ranges::find(host_members, name, &HostMember::name);
  return found == std::end(host_members) ? 0 : found->uses;
}

}  // namespace talutil::testing
