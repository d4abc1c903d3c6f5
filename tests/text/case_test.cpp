#include <gtest/gtest.h>

#include "controls/control_factory.hpp"
#include "controls/name_case_converter.hpp"
#include "controls/name_case_table.hpp"
#include "tests/fakes/recording_control.hpp"
#include "tests/fakes/utils_test.hpp"

namespace talutil::testing {
namespace {

using Case = UtilsTest;

TEST_F(Case, NameCase) {
  // clang-format off
  const std::pair<TextView, TextView> rows[] = {
      {u"", u""}, {u"  two   blanks ", u"  Two   Blanks "}, {u"MARY-ANNE SMITH-JONES", u"Mary-Anne Smith-Jones"},
      {u"O\u00B4NEIL d'arcy l\u2019estrange", u"O\u00B4Neil D'Arcy L\u2019Estrange"}, {u"o'mcdonald", u"O'McDonald"},
      {u"smith's don't dell'acqua qur'an", u"Smith's Don't Dell'Acqua Qur'an"},
      {u"mca macdonald macy MACKAY MACHIN MACQUARIE'S", u"Mca MacDonald Macy Mackay Machin Macquarie's"},
      {u"JOHN AND SONS, 2 by the sea", u"John And Sons, 2 By The Sea"},
      {u"12a la trobe st, 3rd floor melbourne vic", u"12A La Trobe St, 3rd Floor Melbourne VIC"},
      {u"po box 7 nsw\r\npo\nvic smith", u"PO Box 7 NSW\r\nPo\nVic Smith"},
      {u"henry viii xi", u"Henry VIII XI"}, {u"xi jinping", u"Xi Jinping"},
      {u"j.r.r. smith/jones t/a abc", u"J.R.R. Smith/Jones T/A Abc"},
      {u"\u00C9MILE \u00D8RSTED \u00DFa stra\u00DFe", u"\u00C9mile \u00D8rsted \u00DFa Stra\u00DFe"},
      {u"e\u0301MILE \u00E9\u0301", u"E\u0301mile \u00C9\u0301"},
      {u"\u039F\u0394\u03A5\u03A3\u03A3\u0395\u03A5\u03A3", u"\u039F\u03B4\u03C5\u03C3\u03C3\u03B5\u03C5\u03C2"},
      {u"\u041C\u041E\u0421\u041A\u0412\u0410 \u6771\u4EAC", u"\u041C\u043E\u0441\u043A\u0432\u0430 \u6771\u4EAC"},
  };
  // clang-format on
  for (const auto& [text, expected] : rows) EXPECT_EQ(name_case(text), expected) << to_utf8(text);
  for (const auto& [prefix, shortest_rest] : name_case_table::prefixes) {
    for (std::size_t rest = 1; rest < 6; ++rest) {  // No word of the table has a "q" behind a prefix.
      const Text expected = Text(prefix) + (rest < shortest_rest ? u"q" : u"Q") + Text(rest - 1, u'q');
      EXPECT_EQ(name_case(lower_case(TextView(expected))), expected);
    }
  }
}

TEST_F(Case, StylesOfNamesAndSuburbs) {
  const Variant o_neil(u" o'neil ");
  const Rows<std::int16_t, std::int16_t, Variant, Variant, Variant, std::int32_t> rows = {
      {"name case", 0, 1, o_neil, u"O\u00B4Neil", u"O\u00B4Neil", 2},
      {"lower case, not of suburbs", 0, 2, u"A & B", u"a and b", u"A & B", 2},
      {"upper case", 0, 3, o_neil, u"O\u00B4NEIL", u"O\u00B4NEIL", 2},
      {"4 leaves", 0, 4, o_neil, o_neil, o_neil, 2},
      {"flag 1 is name case whatever the style", 1, 3, u"BOX", u"Box", u"BOX", 2},
      {"machinery is re-cased in suburbs alone", 1, 3, u"mAchinery x", u"mAchinery x", u"MACHINERY X", 1},
      {"nothing is left by the cleaning", 0, 3, u" ?", u" ?", u" ?", 2},
      {"Null", 0, 1, Null{}, Null{}, Null{}, 2},
      {"Empty", 0, 1, Variant(), Variant(), Variant(), 2},
  };
  check_rows(rows, [&](auto flag, auto style, const auto& value, const auto& name, const auto& suburb, int cleaned) {
    library.settings().CounterVerifyText = 0;
    library.settings().iCharactercase = library.settings().iCharacterCaseSuburbs = style;
    EXPECT_EQ(utils.ConvertCase(flag, value), name);
    EXPECT_EQ(utils.ConvertCaseSuburbs(value), suburb);
    EXPECT_EQ(library.settings().CounterVerifyText, cleaned);
  });
  EXPECT_EQ(error_of([&] { (void)utils.ConvertCase(0, TextArray{}); }), 13);
  EXPECT_EQ(error_of([&] { (void)utils.ConvertCase(0, ObjectRef()); }), 91);
}

TEST_F(Case, AThirdPartyConverterIsUsedAndReleased) {
  const auto theirs = std::make_shared<RecordingControl>();
  theirs->values = {{"NameCase(\"aandb\")", u"<aandb>"}, {"NameCase(\"c\")", u"<c>"}};
  platform.controls[Text(NameCaseConverter::class_name)] = theirs;
  library.settings().iCharactercase = library.settings().iCharacterCaseSuburbs = 1;
  EXPECT_EQ(utils.ConvertCase(0, u"a&b"), Variant(u"<aandb>"));
  EXPECT_EQ(utils.ConvertCaseSuburbs(u"c"), Variant(u"<c>"));
  theirs->before = [](const std::string&) { throw RunTimeError(1234, u"theirs"); };
  EXPECT_EQ(error_of([&] { (void)utils.ConvertCase(1, u"x"); }), 1234);
  EXPECT_EQ(theirs.use_count(), 2);
}

}  // namespace
}  // namespace talutil::testing
