#pragma once

#include <cstddef>
#include <cstdint>

#include "automation/text.hpp"

/// What name case knows of single words. Every row may be changed and rows may be added, in any order; words are
/// ASCII and met in any case. Sources: common English, Scottish and Irish usage, and the postal abbreviations of
/// Australia.
namespace talutil::name_case_table {

/// Where in a line a spelling holds. Numbers at the start of a line ("12 La Trobe St") are not its first word.
enum class Place : std::uint8_t {
  anywhere,
  after_first,  ///< not in the first word
  before_last   ///< not in the last word
};

struct Spelling {
  TextView word;
  Place place = Place::anywhere;
};

/// A beginning that is followed by a second capital, if at least so many letters are left for that.
struct Prefix {
  TextView text;
  std::size_t shortest_rest = 0;
};

inline constexpr Prefix prefixes[] = {{u"Mac", 3}, {u"Mc", 2}};

inline constexpr Spelling spellings[] = {
    // Words that only look as if they began with Mac.
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

    // Roman numerals. Never in the first word: Xi and Vi are names too. The other numerals of one letter are capitals
    // as all words are.
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

    // Abbreviations of addresses. States that are also names (Vic, Sa) hold after the first word only.
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

    // Other abbreviations that stand in names of customers.
    {u"4WD"},
    {u"JP"},
    {u"OAM"},
    {u"RSL"},
    {u"TAFE"},
    {u"YMCA"},
    {u"YWCA"},
};

/// Beginnings that are followed by an apostrophe and a second capital; every single letter (O, D, L) is one besides.
inline constexpr TextView elisions[] = {u"Dall", u"Dell", u"Sant"};

}  // namespace talutil::name_case_table
