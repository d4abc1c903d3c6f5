#include <gtest/gtest.h>

#include "controls/control_factory.hpp"
#include "controls/name_case_converter.hpp"
#include "tests/fakes/recording_control.hpp"
#include "tests/text/recording_utils.hpp"

namespace talutil::testing {
namespace {

using ChecksAndCase = TextMembersTest;

TEST_F(ChecksAndCase, ValueChecks) {
  const Text long_number(40000, u'7');
  const struct {
    Boolean (ORVUtils::*check)(const Text&);
    Text text;
    bool expected;
  } rows[] = {
      {&ORVUtils::IsValueNumber, u"1.2.3", true},
      {&ORVUtils::IsValueNumber, u".", true},
      {&ORVUtils::IsValueNumber, long_number, true},
      {&ORVUtils::IsValueNumber, u"", false},
      {&ORVUtils::IsValueNumber, u"-5", false},
      {&ORVUtils::IsValueNumber, u"1,5", false},
      {&ORVUtils::IsValueDate, u"15-11-2024", true},
      {&ORVUtils::IsValueDate, u"1/3/24", true},
      {&ORVUtils::IsValueDate, u"99/99/9999", true},
      {&ORVUtils::IsValueDate, u"12/3/2024", false},  // "3/" is taken for the month.
      {&ORVUtils::IsValueDate, u"1/123/2024", true},  // The third character of the month is never looked at.
      {&ORVUtils::IsValueDate, u"12//2024", false},
      {&ORVUtils::IsValueDate, u"1//2024", false},
      {&ORVUtils::IsValueDate, u"123/1/2024", false},
      {&ORVUtils::IsValueDate, u"1/1/", false},
      {&ORVUtils::IsValueDate, u"1/1/2024 10:00", false},
      {&ORVUtils::IsValueDate, u"x/1/2024", false},
      {&ORVUtils::IsValueDate, u"1/1/" + long_number, true},
      {&ORVUtils::IsValueDate, u"", false},
      {&ORVUtils::IsValueTime, u"9:30", true},
      {&ORVUtils::IsValueTime, u"25:99", true},
      {&ORVUtils::IsValueTime, u"930", false},
      {&ORVUtils::IsValueTime, u":30", false},
      {&ORVUtils::IsValueTime, u"9:", false},
      {&ORVUtils::IsValueTime, u"009:30", false},
      {&ORVUtils::IsValueTime, u"09:30:00", false},
      {&ORVUtils::VerifyEmail, u"", true},
      {&ORVUtils::VerifyEmail, u".@", true},
      {&ORVUtils::VerifyEmail, u"a.b", false},
      {&ORVUtils::VerifyEmail, u"a@b", false},
      {&ORVUtils::VerifyPasswordText, u"", true},
      {&ORVUtils::VerifyPasswordText, u"09AZ", true},
      {&ORVUtils::VerifyPasswordText, u"ABc", false},
      {&ORVUtils::VerifyPasswordText, u"A@", false},
      {&ORVUtils::VerifyPasswordText, u"A[", false},
      {&ORVUtils::NumbersInString, u"ab0", true},
      {&ORVUtils::NumbersInString, u"ab/:", false},
  };
  for (const auto& row : rows) {
    const auto index = &row - rows;
    EXPECT_EQ((utils.*row.check)(row.text), Boolean(row.expected)) << index << " " << to_utf8(row.text.substr(0, 20));
  }
}

TEST_F(ChecksAndCase, NameCase) {
  const struct {
    TextView text, expected;
  } rows[] = {
      {u"", u""},
      {u"  two   blanks ", u"  Two   Blanks "},
      {u"MARY-ANNE SMITH-JONES", u"Mary-Anne Smith-Jones"},
      {u"O\u00B4NEIL d'arcy l\u2019estrange", u"O\u00B4Neil D'Arcy L\u2019Estrange"},
      {u"smith's don't dell'acqua qur'an", u"Smith's Don't Dell'Acqua Qur'an"},
      {u"o'mcdonald", u"O'McDonald"},
      {u"mcdonald mc mca macdonald macy mace", u"McDonald Mc Mca MacDonald Macy Mace"},
      {u"MACKAY MACHIN MACQUARIE'S", u"Mackay Machin Macquarie's"},
      {u"JOHN AND SONS, 2 by the sea", u"John And Sons, 2 By The Sea"},
      {u"12a la trobe st, 3rd floor melbourne vic", u"12A La Trobe St, 3rd Floor Melbourne VIC"},
      {u"po box 7 nsw\r\npo\nvic smith", u"PO Box 7 NSW\r\nPo\nVic Smith"},
      {u"henry viii xi", u"Henry VIII XI"},
      {u"xi jinping", u"Xi Jinping"},
      {u"j.r.r. smith/jones t/a abc", u"J.R.R. Smith/Jones T/A Abc"},
      {u"\u00C9MILE \u00D8RSTED \u00DFa stra\u00DFe", u"\u00C9mile \u00D8rsted \u00DFa Stra\u00DFe"},
      {u"e\u0301MILE \u00E9\u0301", u"E\u0301mile \u00C9\u0301"},
      {u"\u039F\u0394\u03A5\u03A3\u03A3\u0395\u03A5\u03A3", u"\u039F\u03B4\u03C5\u03C3\u03C3\u03B5\u03C5\u03C2"},
      {u"\u041C\u041E\u0421\u041A\u0412\u0410 \u6771\u4EAC", u"\u041C\u043E\u0441\u043A\u0432\u0430 \u6771\u4EAC"},
  };
  for (const auto& row : rows) EXPECT_EQ(name_case(row.text), row.expected) << to_utf8(row.text);
}

TEST_F(ChecksAndCase, StylesOfNamesAndSuburbs) {
  const Variant o_neil(u" o'neil ");
  const struct {
    const char* name;
    std::int32_t flag, style;
    Variant value, expected, suburb;
    std::int32_t cleaned;
  } rows[] = {
      {"0 leaves", 1, 0, o_neil, o_neil, o_neil, 0},
      {"name case", 0, 1, o_neil, u"O\u00B4Neil", u"O\u00B4Neil", 2},
      {"lower case, not of suburbs", 0, 2, u"A & B", u"a and b", u"A & B", 2},
      {"upper case", 0, 3, o_neil, u"O\u00B4NEIL", u"O\u00B4NEIL", 2},
      {"4 leaves", 0, 4, o_neil, o_neil, o_neil, 2},
      {"flag 1 is name case whatever the style", 1, 3, u"BOX", u"Box", u"BOX", 2},
      {"machinery is never re-cased, but in suburbs", 1, 3, u"Heavy mAchinery", u"Heavy mAchinery", u"HEAVY MACHINERY",
       1},
      {"nothing is left by the cleaning", 0, 3, u" ?", u" ?", u" ?", 2},
      {"Null", 0, 1, Null{}, Null{}, Null{}, 2},
      {"Empty", 0, 1, Variant(), Variant(), Variant(), 2},
      {"a number", 0, 3, std::int16_t{5}, u"5", u"5", 2},
  };
  for (const auto& row : rows) {
    library.settings().CounterVerifyText = 0;
    library.settings().iCharactercase = library.settings().iCharacterCaseSuburbs = static_cast<std::int16_t>(row.style);
    EXPECT_EQ(utils.ConvertCase(static_cast<std::int16_t>(row.flag), row.value), row.expected) << row.name;
    EXPECT_EQ(utils.ConvertCaseSuburbs(row.value), row.suburb) << row.name;
    EXPECT_EQ(library.settings().CounterVerifyText, row.cleaned) << row.name;
  }
  EXPECT_EQ(error_of([&] { (void)utils.ConvertCase(0, TextArray{}); }), 13);
  EXPECT_EQ(error_of([&] { (void)utils.ConvertCase(0, ObjectRef()); }), 91);
}

TEST_F(ChecksAndCase, AnotherMakersConverterIsUsedAndReleased) {
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
