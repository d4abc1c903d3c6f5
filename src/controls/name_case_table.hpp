#pragma once

#include <cstddef>
#include <cstdint>

#include "automation/text.hpp"

/// Special rules for single words. Rows may be changed and added freely, in any order. Words are ASCII and match in any
/// case. Sources: common English, Scottish and Irish usage, and the postal abbreviations of Australia.
namespace talutil::name_case_table {

/// Where in a line a spelling applies. A number at the start of a line ("12 La Trobe St") is not its first word.
enum class Place : std::uint8_t {
  anywhere,
  after_first,  ///< not in the first word
  before_last   ///< not in the last word
};

struct Spelling {
  TextView word;
  Place place = Place::anywhere;
};

/// A prefix followed by a second capital, if at least `shortest_rest` letters come after it.
struct Prefix {
  TextView text;
  std::size_t shortest_rest = 0;
};

inline constexpr Prefix prefixes[] = {{u"Mac", 3}, {u"Mc", 2}};

inline constexpr Spelling spellings[] = {
    // Words that only seem to begin with the prefix Mac.
    {u"Macadam"},
    {u"Macaluso"},
    {u"Macaulay"},
    {u"Macbeth"},
    {u"Macedo"},
    {u"Macedon"},
    {u"Macedonia"},
    {u"Macedonian"},
    {u"Machado"},
    {u"Machell"},
    {u"Machen"},
    {u"Machin"},
    {u"Machine"},
    {u"Machinery"},
    {u"Machines"},
    {u"Machinist"},
    {u"Macias"},
    {u"Maciel"},
    {u"Mackay"},
    {u"Macken"},
    {u"Mackenzie"},
    {u"Mackerel"},
    {u"Mackereth"},
    {u"Mackey"},
    {u"Mackie"},
    {u"Mackin"},
    {u"Mackinlay"},
    {u"Mackintosh"},
    {u"Macklem"},
    {u"Macklin"},
    {u"Mackness"},
    {u"Mackrell"},
    {u"Macksville"},
    {u"Maclay"},
    {u"Maclean"},
    {u"Macleay"},
    {u"Maclin"},
    {u"Macquarie"},
    {u"Macready"},
    {u"Macrossan"},

    // Roman numerals. Not in the first word, because Xi and Vi are also names. Single-letter numerals are capitals
    // anyway, like all words of one letter.
    {u"II", Place::after_first},
    {u"III", Place::after_first},
    {u"IV", Place::after_first},
    {u"VI", Place::after_first},
    {u"VII", Place::after_first},
    {u"VIII", Place::after_first},
    {u"IX", Place::after_first},
    {u"XI", Place::after_first},
    {u"XII", Place::after_first},
    {u"XIII", Place::after_first},
    {u"XIV", Place::after_first},
    {u"XV", Place::after_first},
    {u"XVI", Place::after_first},

    // Abbreviations in addresses. States that are also names (Vic, Sa) apply only after the first word.
    {u"ACT", Place::after_first},
    {u"CBD"},
    {u"CMB"},
    {u"GPO"},
    {u"LPO"},
    {u"NSW"},
    {u"NT", Place::after_first},
    {u"NZ"},
    {u"PMB"},
    {u"PO", Place::before_last},
    {u"QLD"},
    {u"RMB"},
    {u"RSD"},
    {u"SA", Place::after_first},
    {u"TAS", Place::after_first},
    {u"UK"},
    {u"USA"},
    {u"VIC", Place::after_first},
    {u"WA", Place::after_first},

    // Other abbreviations found in customers' names.
    {u"4WD"},
    {u"JP"},
    {u"OAM"},
    {u"RSL"},
    {u"TAFE"},
    {u"YMCA"},
    {u"YWCA"},
};

/// Beginnings that are followed by an apostrophe and a second capital, in addition to every single letter (O, D, L).
inline constexpr TextView elisions[] = {u"Dall", u"Dell", u"Sant"};

}  // namespace talutil::name_case_table
