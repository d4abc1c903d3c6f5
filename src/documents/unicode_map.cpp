#include "documents/unicode_map.hpp"

#include <algorithm>
#include <vector>

#include "documents/arabic_joining.hpp"

namespace talutil {

namespace {

std::string hex_of(std::uint32_t unit) {
  static constexpr char digits[] = "0123456789ABCDEF";
  std::string hex = "<";
  for (int shift = 12; shift >= 0; shift -= 4) hex += digits[unit >> shift & 0xF];
  return hex + ">";
}

bool is_form(std::uint32_t unit) { return letter_of_form(static_cast<char16_t>(unit)) != unit; }

/// Rows in sections, which may have at most a hundred.
void append_sections(std::string& map, const std::string& kind, const std::vector<std::string>& rows) {
  constexpr std::size_t most = 100;
  for (std::size_t first = 0; first < rows.size(); first += most) {
    const std::size_t end = std::min(first + most, rows.size());
    map += std::to_string(end - first) + " begin" + kind + "\n";
    for (std::size_t i = first; i < end; ++i) map += rows[i] + "\n";
    map += "end" + kind + "\n";
  }
}

}  // namespace

std::string unicode_map() {
  std::vector<std::string> ranges;
  std::vector<std::string> forms;
  // No range may cross a change of the first byte.
  for (std::uint32_t page = 0; page <= 0xFF00; page += 0x100) {
    const std::uint32_t end = page + 0x100;
    for (std::uint32_t first = page; first < end; ++first) {
      if (is_form(first)) {
        forms.push_back(hex_of(first) + " " + hex_of(letter_of_form(static_cast<char16_t>(first))));
        continue;
      }
      std::uint32_t last = first;
      while (last + 1 < end && !is_form(last + 1)) ++last;
      ranges.push_back(hex_of(first) + " " + hex_of(last) + " " + hex_of(first));
      first = last;
    }
  }
  std::string map =
      "/CIDInit /ProcSet findresource begin\n12 dict begin\nbegincmap\n"
      "/CIDSystemInfo << /Registry (Adobe) /Ordering (UCS) /Supplement 0 >> def\n"
      "/CMapName /Adobe-Identity-UCS def\n/CMapType 2 def\n"
      "1 begincodespacerange\n<0000> <FFFF>\nendcodespacerange\n";
  append_sections(map, "bfrange", ranges);
  append_sections(map, "bfchar", forms);
  return map + "endcmap\nCMapName currentdict /CMap defineresource pop\nend\nend\n";
}

}  // namespace talutil
