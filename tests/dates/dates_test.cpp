#include "dates/week_tables.hpp"
#include "tests/fakes/late_members.hpp"
#include "tests/fakes/recording_control.hpp"

namespace talutil::testing {
namespace {

// clang-format off
constexpr LateRow calendar_rows[] = {
    {u"GetYear", u"@null", "2000"}, {u"GetYear", u"", "2000"}, {u"GetYear", u"@empty", "2000"},
    {u"GetMonth", u"@null", "1"}, {u"GetDay", u"", "1"}, {u"GetYear", u"5/3/0100", "100"},
    {u"GetYear", u"31/12/9999 23:59", "9999"}, {u"GetMonth", u"5/3/2009", "3"}, {u"GetDay", u"=39877.9", "5"},
    {u"GetMonth", u"12/31/2009", "12"}, {u"GetDay", u"#29/12/1899 06:00#", "29"}, {u"GetDay", u"31/2/2009", "error 13"},
    {u"GetYear", u"1/1/10000", "error 13"}, {u"GetYear", u"=3000000", "error 6"}, {u"GetYear", u"@error", "error 13"},
    {u"GetDaysThisMonth", u"2|1900", "28"}, {u"GetDaysThisMonth", u"2|2000", "29"},
    {u"GetDaysThisMonth", u"2|2008", "29"}, {u"GetDaysThisMonth", u"0|2008", "28"}, {u"GetDaysThisMonth", u"5|0", "28"},
    {u"GetDaysThisMonth", u"13|2008", "error 9"}, {u"GetDaysThisMonth", u"-1|2008", "error 9"},
    {u"GetDaysThisMonth", u"13|0", "28"}, {u"GetDaysThisMonth", u"2|-4", "29"},
    {u"SetDayOfMonth", u"5/3/2009 17:00|9", "09/03/2009"}, {u"SetDayOfMonth", u"5/2/2009|31", "31/2/2009"},
    {u"SetDayOfMonth", u"5/2/2009|0", "0/2/2009"}, {u"SetDayOfMonth", u"5/2/2009|-1", "-1/2/2009"},
    {u"SetDayOfMonth", u"@null|1", "error 94"}, {u"SetDayOfMonth", u"|1", "error 13"},
    {u"GetFinancialYearStr", u"15/08/2009", "0910"}, {u"GetFinancialYearStr", u"15/03/2010", "0910"},
    {u"GetFinancialYearStr", u"30/06/2009", "0809"}, {u"GetFinancialYearStr", u"01/07/2009", "0910"},
    {u"GetFinancialYearStr", u"01/07/1999", "99100"}, {u"GetFinancialYearStr", u"01/03/2000", "-100"},
    {u"GetFinancialYearStr", u"@null", "error 13"}, {u"GetFinancialYearStr", u"soon", "error 13"},
    {u"GetDateFromString", u"29022008", "29/02/2008"}, {u"GetDateFromString", u"29022009", ""},
    {u"GetDateFromString", u"1234567", ""}, {u"GetDateFromString", u"3l122008", ""},
    {u"GetDateFromString", u"31122101", ""}, {u"GetDateFromString", u"31122100", "31/12/2100"},
    {u"GetDateFromString", u"31121899", ""}, {u"GetDateFromString", u"00012000", ""},
    {u"GetDateFromString", u"01132000", ""}, {u"GetDateFromString", u"010120001", ""},
    {u"VerifyNullTime", u"0|@null", "01:30"}, {u"VerifyNullTime", u"0|14:05:59", "14:05"},
    {u"VerifyNullTime", u"0|24:00", "01:30"}, {u"VerifyNullTime", u"1|=0.5", "01:30"},
    {u"VerifyNullTime", u"7|5/3/2009", "00:00"}, {u"VerifyNullTime", u"0|@error", "01:30"},
    {u"VerifyNullDate", u"0|5/3/2009 13:45", "05/03/2009"}, {u"VerifyNullDate", u"2|05/03/2009 13:45", "05/03/2009 13:45"},
    {u"VerifyNullDate", u"4|05/03/2009", "05032009"}, {u"VerifyNullDate", u"9|#5/3/2009#", "05/03/2009"},
    {u"VerifyNullDate", u"0|@null", "#01/01/1980#"}, {u"VerifyNullDate", u"1|", "#01/01/1980#"},
    {u"VerifyNullDate", u"4|@empty", "#01/01/1980#"}, {u"VerifyNullDate", u"0|@error", "#01/01/1980#"},
    {u"VerifyNullDate", u"0|=39877", "#01/01/1980#"}, {u"VerifyNullDate", u"0|12/12/1975", "#01/01/1980#"},
    {u"VerifyNullDate", u"2|31/2/2009", "#01/01/1980#"}, {u"VerifyNullDate", u"3|01/01/1980", "#01/01/1980#"},
    {u"VerifyNullDate", u"0|00:00:00", "#01/01/1980# | 01/01/1980"}, {u"VerifyNullDate", u"0|00:00", "#01/01/1980#"},
    // On the day itself but not at midnight, an empty text comes back and not the date.
    {u"VerifyNullDate", u"0|01/01/1980 09:00", ""}, {u"VerifyNullDate", u"1|01/01/1980 09:00", "01/01/1980"},
    {u"VerifyNullDate", u"2|01/01/1980 09:00", "01/01/1980 09:00"}, {u"VerifyNullDate", u"4|01/01/1980 09:00", ""},
    {u"VerifyNullDate", u"2|01/01/1980 00:00:20", ""}, {u"VerifyNullDate", u"3|01/01/1980 09:00", "06/07/2009 12:00"},
    {u"VerifyNullDate", u"3|02/01/1980", "02/01/1980"},
};

// The clock stands in 2009, a common year.
constexpr LateRow week_rows[] = {
    {u"GetWeekNumber", u"7/1/2009", "1"}, {u"GetWeekNumber", u"8/1/2009 10:00", "2"},
    {u"GetWeekNumber", u"24/12/2009", "52"}, {u"GetWeekNumber", u"23/12/2009", "51"},
    {u"GetWeekNumber", u"31/12/2008", "52"}, {u"GetWeekNumber", u"@null", "1"}, {u"GetWeekNumber", u"", "1"},
    {u"GetWeekNumber", u"29/2/2009", "error 13"}, {u"GetWeekNumber", u"1/1/0100", "1"},
    {u"WeekYearToDate", u"1|2009|1", "#01/01/2009#"}, {u"WeekYearToDate", u"52|2009|2", "#31/12/2009#"},
    {u"WeekYearToDate", u"60|2009|1", "#24/12/2009# | 52"}, {u"WeekYearToDate", u"0|2009|2", "#07/01/2009# | 1"},
    {u"WeekYearToDate", u"-9|2009|3", "Empty | 1"}, {u"WeekYearToDate", u"1|2009|0", "08/01/2009"},
    {u"WeekYearToDate", u"52|2008|0", "30/12/2008"}, {u"WeekYearToDate", u"10|2008|1", "#05/03/2008#"},
    {u"WeekYearToDate", u"51|2008|2", "#23/12/2008#"}, {u"WeekYearToDate", u"1|9|1", "#01/01/2009#"},
    {u"WeekYearToDate", u"1|0|0", "08/01/2000"}, {u"WeekYearToDate", u"1|-1|1", "error 13"},
    {u"WeekYearToDate", u"99|10000|0", "error 13 | 52"}, {u"WeekYearToDate", u"1|10000|7", "Empty"},
    {u"GetWeekInDateRange", u"01/03/2009|31/01/2009|1|2009", "True"},
    {u"GetWeekInDateRange", u"01/03/2009|07/01/2009|1|2009", "False"},
    {u"GetWeekInDateRange", u"31/01/2009|01/03/2009|1|2009", "True"},
    {u"GetWeekInDateRange", u"08/01/2009|01/01/2009|1|2009", "True"},
    {u"GetWeekInDateRange", u"09/01/2009|07/01/2009|0|2009", "False | 1"},
    {u"GetWeekInDateRange", u"x|07/01/2009|1|2009", "error 13"}, {u"GetWeekInDateRange", u"1/1/2009|@null|1|2009", "error 94"},
};

constexpr LateRow stepping_rows[] = {
    {u"IncDay", u"31/12/2009|1", "01/01/2010"}, {u"IncDay", u"01/03/2008|-1", "29/02/2008"},
    {u"IncDay", u"5/3/2009 17:00|0", "05/03/2009"}, {u"IncDay", u"5/3/2009|-32768", "error 6"},
    {u"IncDay", u"31/12/9999|1", "1/1/10000"}, {u"IncDay", u"01/01/0100|-1", "31/12/1999"},
    {u"IncDay", u"31/2/2009|0", "error 13"}, {u"IncDay", u"@null|0", "error 13"}, {u"IncDay", u"5/3/2009|40000", "error 6"},
    {u"IncWeek", u"25/02/2008|1", "03/03/2008"}, {u"IncWeek", u"25/02/2008|4681", "11/11/2097"},
    {u"IncWeek", u"25/02/2008|-4682", "error 6"}, {u"IncWeek", u"25/02/2008|4682", "error 6"},
    {u"IncMonth", u"31/03/2009|-1", "28/02/2009"}, {u"IncMonth", u"15/12/2009|1", "15/01/2010"},
    {u"IncMonth", u"15/01/2009|-13", "15/12/2007"}, {u"IncMonth", u"31/12/2009|0", "31/12/2009"},
    {u"IncMonth", u"31/12/2009|-32768", "error 6"}, {u"IncMonth", u"31/3/0100|-1204", "30/11/-1"},
    {u"IncYear", u"29/02/2008|1", "28/02/2009"}, {u"IncYear", u"29/02/2008|4", "29/02/2012"},
    {u"IncYear", u"29/02/2008|-2008", "28/02/2000"}, {u"IncYear", u"1/1/2009|30758", "1/1/32767"},
    {u"IncYear", u"1/1/2009|30759", "error 6"}, {u"IncYear", u"1/1/2009|-1910", "01/01/1999"},
    {u"GetNextDate", u"31/1/2009|Monthly|1", "28/02/2009"}, {u"GetNextDate", u"31/1/2009|Months|1", "28/02/2009"},
    {u"GetNextDate", u"31/1/2009|Years|1", "31/01/2010"}, {u"GetNextDate", u"31/1/2009|Yearly|-1", "31/01/2008"},
    {u"GetNextDate", u"31/1/2009|Weeks|1", "07/02/2009"}, {u"GetNextDate", u"31/1/2009|Weekly|2", "14/02/2009"},
    {u"GetNextDate", u"31/1/2009|Days|=1.5", "02/02/2009"}, {u"GetNextDate", u"31/1/2009|Daily|1", "01/02/2009"},
    {u"GetNextDate", u"31/1/2009|monthly|3", "30/12/1899"}, {u"GetNextDate", u"x|@null|3", "30/12/1899"},
    {u"GetNextDate", u"31/1/2009|Daily|x", "error 13"}, {u"GetNextDate", u"31/1/2009|@null|40000", "error 6"},
    {u"GetNextDate", u"31/12/9999|Yearly|1", "31/12/10000"},
    {u"AddTimeToDate", u"05/03/2009 17:00|9:05", "05/03/2009 09:05"}, {u"AddTimeToDate", u"05/03/2009|9 pm", "05/03/2009 21:00"},
    {u"AddTimeToDate", u"05/03/2009|24:00", "error 13"}, {u"AddTimeToDate", u"29/2/2009|9:00", "error 13"},
};

constexpr LateRow duration_rows[] = {
    {u"DateTimeToDuration", u"01/01/1800 01:30", "1:30"}, {u"DateTimeToDuration", u"#01/01/1800 00:05#", "0:5"},
    {u"DateTimeToDuration", u"#02/01/1800 02:00#", "26:0"}, {u"DateTimeToDuration", u"31/12/1799 22:30", "-1:-30"},
    {u"DateTimeToDuration", u"30/12/1899 01:30", "1:30 | 1/1/1800 01:30"},
    {u"DateTimeToDuration", u"#01:30:15#", "1:30 | 1/1/1800 01:30"}, {u"DateTimeToDuration", u"#00:00#", "0:0 | 1/1/1800 00:00"},
    {u"DateTimeToDuration", u"30/12/1899", "error 13 | 1/1/1800 /1899"}, {u"DateTimeToDuration", u"@null", "error 94"},
    {u"DateTimeToDuration", u"31/12/9999", "error 6"},
    {u"DurationToDateTime", u"1:30", "#01/01/1800 01:30#"}, {u"DurationToDateTime", u"#5/3/2009 23:59:59#", "#01/01/1800 23:59#"},
    {u"DurationToDateTime", u"24:00", "#02/01/1800#"}, {u"DurationToDateTime", u"7.5", "error 13"},
    {u"DurationToDateTime", u"26:x", "error 13"}, {u"DurationToDateTime", u"1:100", "error 13"},
    {u"DurationToDateTime", u"99999999999:0", "error 6"},
    {u"DurationToDateTime", u"=7.5", "#01/01/1800 12:00#"}, {u"DurationToDateTime", u"@null", "error 13"},
    {u"ConvertDurationToNumber", u"00:00", "1.5"}, {u"ConvertDurationToNumber", u"01:45", "1.75"},
    {u"ConvertDurationToNumber", u"01:10", "1"}, {u"ConvertDurationToNumber", u"00:15", "0.25"},
    {u"ConvertDurationToNumber", u"-2:30", "2.5"}, {u"ConvertDurationToNumber", u"24:00", "0"},
    {u"ConvertDurationToNumber", u"@null", "0"}, {u"ConvertDurationToNumber", u"#02/01/1800 01:00#", "1"},
    {u"DurToTime", u"1.5", "#01/01/1800 01:30#"}, {u"DurToTime", u" 1.75 ", "#01/01/1800 01:45# | 1.75"},
    {u"DurToTime", u"2", "#01/01/1800 02:00#"}, {u"DurToTime", u".25", "#01/01/1800 00:15#"},
    {u"DurToTime", u"1.50", "#01/01/1800 01:50#"}, {u"DurToTime", u"1.1", "#01/01/1800 01:01#"},
    {u"DurToTime", u"1.99", "#01/01/1800 02:39#"}, {u"DurToTime", u" ", "error 13 | "}, {u"DurToTime", u"25.5", "#02/01/1800 01:30#"},
    {u"ConvertDatabaseDurationToNumber", u"02/01/1800 01:00", "1"}, {u"ConvertDatabaseDurationToNumber", u"02/01/1800", "24"},
    {u"ConvertDatabaseDurationToNumber", u"01/01/1800", "1.5"}, {u"ConvertDatabaseDurationToNumber", u"01/01/1800 08:05", "8"},
    {u"ConvertDatabaseDurationToNumber", u"01/01/1800 00:15", "0.25"}, {u"ConvertDatabaseDurationToNumber", u"31/12/1799 22:30", "-0.5"},
    {u"ConvertDatabaseDurationToNumber", u"1:30", "1.5 | 1/1/1800 1:30"},
    {u"ConvertNumberToDatabaseDuration", u"90", "#01/01/1800 01:30#"}, {u"ConvertNumberToDatabaseDuration", u"1439", "#01/01/1800 23:59#"},
    {u"ConvertNumberToDatabaseDuration", u"1500", "#02/01/1800 01:00#"}, {u"ConvertNumberToDatabaseDuration", u"-65", "#31/12/1799 22:55#"},
    {u"ConvertDatabaseDurationToMinutes", u"#01/01/1800 01:30#", "90"}, {u"ConvertDatabaseDurationToMinutes", u"#01:30#", "90 | 1/1/1800 01:30"},
    {u"ConvertDatabaseDurationToMinutes", u"=0.0625", "error 13 | 1/1/1800 .0625"},
    {u"ConvertTimeToMinutes", u"13:45", "825"}, {u"ConvertTimeToMinutes", u"#5/3/2009 23:59:59#", "1439"},
    {u"ConvertTimeToMinutes", u"@empty", "0"}, {u"ConvertTimeToMinutes", u"24:00", "error 13"},
};

constexpr LateRow period_rows[] = {
    {u"GetDaysInPeriod", u"01/03/2024|01/03/2024 23:00", "0"}, {u"GetDaysInPeriod", u"01/03/2024|05/03/2024", "4"},
    {u"GetDaysInPeriod", u"05/03/2024|01/03/2024", "4"}, {u"GetDaysInPeriod", u"28/02/2024|#01/03/2024#", "2"},
    {u"GetDaysInPeriod", u"|01/03/2024", "-1"}, {u"GetDaysInPeriod", u"x|@empty", "-1"},
    {u"GetDaysInPeriod", u"@null|01/03/2024", "error 13"}, {u"GetDaysInPeriod", u"30/2/2024|1/3/2024", "error 13"},
    {u"GetDaysInPeriod", u"1/1/0100|30/12/9999", "3615898"}, {u"GetDaysInPeriod", u"30/12/9999|31/12/9999", "error 6"},
    {u"GetDaysInPeriod", u"31/12/9999|31/12/9999", "0"},
    {u"GetMonthsInPeriod", u"10/03/2024|10/03/2024 09:00", "-1"}, {u"GetMonthsInPeriod", u"31/01/2024|01/02/2024", "1"},
    {u"GetMonthsInPeriod", u"15/03/2024|15/01/2024", "2"}, {u"GetMonthsInPeriod", u"10/03/2024|11/03/2024", "0"},
    {u"GetMonthsInPeriod", u"31/12/9999|01/12/9999", "error 6"}, {u"GetMonthsInPeriod", u"1/1/2024|", "-1"},
    {u"GetTimeDifference", u"10/03/2024|10/03/2024|09:00|10:30", "1:30"},
    {u"GetTimeDifference", u"10/3/2024|#11/03/2024 08:00#|#22:00:30#|2:00", "4:0 | 10/03/2024 | 11/03/2024 | 22:00 | 02:00"},
    {u"GetTimeDifference", u"31/01/2024|01/02/2024|22:00|02:00", "-20:0"},
    {u"GetTimeDifference", u"10/03/2024|10/03/2024|10:30|09:00", "-1:-30"},
    {u"GetTimeDifference", u"10/03/2024|10/03/2024|09:00|09:05", "0:5"},
    {u"GetTimeDifference", u"01/01/0100|31/12/9999|09:00|09:05", "error 6"},
    {u"GetTimeDifference", u"1/1/2024|2/1/2024|x|09:05", "error 13 | 01/01/2024 | 02/01/2024"},
    {u"GetTimeDifference", u"1/1/2024|@null|9:00|09:05", "error 13 | 01/01/2024"},
};

constexpr LateRow utc_rows[] = {  // ten hours ahead
    {u"LocalTimeToUTC", u"05/03/2009 13:45", "#05/03/2009 03:45#"}, {u"UTCToLocalTime", u"#05/03/2009 03:45:30#", "#05/03/2009 13:45:30#"},
    {u"LocalTimeToUTC", u"01/01/1500 12:00", "#01/01/1500 12:00#"}, {u"UTCToLocalTime", u"01/01/1500 12:00", "#01/01/1601 10:00#"},
    {u"UTCToLocalTime", u"31/12/9999 20:00", "error 5"}, {u"LocalTimeToUTC", u"29/2/2009", "error 13"},
};
// clang-format on

using DateMembers = LateMembers;

TEST_F(DateMembers, Calendar) { check(calendar_rows); }
TEST_F(DateMembers, Weeks) { check(week_rows); }
TEST_F(DateMembers, Stepping) { check(stepping_rows); }
TEST_F(DateMembers, Durations) { check(duration_rows); }
TEST_F(DateMembers, Periods) { check(period_rows); }
TEST_F(DateMembers, Utc) { check(utc_rows); }

TEST_F(DateMembers, CountersCountEveryCallAndStopAtTheirEnd) {
  call(u"VerifyNullTime", u"0|@error");
  call(u"VerifyNullDate", u"0|@null");
  EXPECT_EQ(library.settings().CounterVerifyTime, 1);
  EXPECT_EQ(library.settings().CounterVerifyDate, 1);
  library.settings().CounterVerifyTime = library.settings().CounterVerifyDate = 2147483647;
  EXPECT_EQ(call(u"VerifyNullTime", u"0|13:45"), "error 6");
  EXPECT_EQ(call(u"VerifyNullDate", u"0|00:00:00"), "error 6");
}

TEST_F(DateMembers, WeekTablesHaveTheCalendarOfTheCurrentYear) {
  platform.current_time = {39600};  // 1 June 2008
  EXPECT_EQ(call(u"WeekYearToDate", u"10|2009|1"), "#04/03/2009#");
  EXPECT_EQ(call(u"WeekYearToDate", u"9|2009|2"), "#03/03/2009#");
  EXPECT_EQ(call(u"WeekYearToDate", u"52|2009|1"), "#23/12/2009#");
  EXPECT_EQ(library.part<WeekTables>().start(2), u"08/01/2009");
  EXPECT_EQ(library.part<WeekTables>().end(52), u"31/12/2009");
  EXPECT_EQ(library.part<WeekTables>().start(53) + library.part<WeekTables>().end(53), u"");
}

TEST_F(DateMembers, MinutesThatHaveNoTextAreReportedInABox) {
  EXPECT_EQ(call(u"ConvertNumberToDatabaseDuration", u"-90"), "1/1/1800 00:00");
  EXPECT_EQ(platform.messages,
            (std::vector<FakePlatform::Message>{
                {u"ORVUtils ConvertNumberToDatabaseDuration Type mismatch", MessageButtons::ok, {}}}));
}

TEST_F(DateMembers, DurationsUseTheObjectsTextMembers) {
  utils.ConvertDurationToNumber(u"-2:30");
  Text hours = u".5";
  utils.DurToTime(hours);
  EXPECT_EQ(utils.calls,
            (std::vector<Text>{u"StringReplace|-2:30|-|0", u"MyPos|:|02:30|1", u"MyPos|.|.5|1", u"MyPos|:|00:30|1"}));
}

TEST_F(DateMembers, ADateWithoutAYearIsOfTheCurrentOne) { EXPECT_EQ(call(u"IncDay", u"5/3|0"), "05/03/2009"); }

TEST_F(DateMembers, ObjectsStandForRecords) {
  const auto object = std::make_shared<RecordingControl>();
  constexpr std::pair<const char*, std::int16_t> fields[] = {{"wYear", 2009},    {"wMonth", 3},        {"wDay", 31},
                                                             {"wHour", 9},       {"wMinute", 0},       {"wSecond", 0},
                                                             {"wDayOfWeek", 77}, {"wMilliseconds", 88}};
  for (const auto& [name, value] : fields) object->values[name] = value;
  const auto use = [&](TextView member, std::vector<Argument> arguments) {
    return call(member, Access::call, arguments), arguments;
  };
  const Variant holder = ObjectRef(object);
  EXPECT_EQ(use(u"SystemTimeToDate", {holder, Variant()})[1].value.to_text(plain_numbers), u"31/03/2009 09:00");
  const auto after = use(u"DateToSystemTime", {Variant(u"5/3/2009 13:00"), holder});
  std::erase_if(object->uses, [](const std::string& entry) { return !entry.starts_with("put"); });
  EXPECT_EQ(object->uses, (std::vector<std::string>{"put wDay = 5%", "put wHour = 13%"}));
  EXPECT_EQ(after[1].value, holder);
  const auto without_seconds = std::make_shared<RecordingControl>();
  without_seconds->values = object->values;
  without_seconds->values.erase("wSecond");
  EXPECT_EQ(error_of([&] {
              use(u"DateToSystemTime", {Variant(u"6/4/2010"), Variant(ObjectRef(without_seconds))});
            }),
            438);
  EXPECT_EQ(error_of([&] { use(u"DateToSystemTime", {Variant(u"6/4/2010"), Variant()}); }), 13);
}

TEST_F(DateMembers, SystemTimes) {
  SystemTime time{.wDayOfWeek = 77, .wMilliseconds = 88};
  utils.DateToSystemTime({39877.5732638889}, time);
  EXPECT_EQ(time, (SystemTime{2009, 3, 77, 5, 13, 45, 30, 88}));
  const Rows<SystemTime, std::string> rows = {
      {"parts as they are", time, "05/03/2009 13:45:30"},
      {"month 13", SystemTime{2009, 13, 0, 5}, "05/01/2010"},
      {"month 0", SystemTime{2009, 0, 0, 5}, "05/12/2008"},
      {"day 0", SystemTime{2009, 3, 0, 0}, "28/02/2009"},
      {"beyond the year 9999 and back", SystemTime{9999, 25, 0, -5033}, "22/03/9987"},
      {"hours beyond the day", SystemTime{2009, 12, 0, 31, 25, -1, 61}, "01/01/2010 01:00:01"},
      {"before day 0", SystemTime{1800, 1, 0, 1, 1, 30}, "01/01/1800 01:30"},
      {"two-digit year", SystemTime{29, 1, 0, 1}, "01/01/2029"},
      {"two-digit year of the last century", SystemTime{30, 1, 0, 1}, "01/01/1930"},
      {"zeros", SystemTime{}, "30/11/1999"},
  };
  check_rows(rows, [&](const SystemTime& parts, const std::string& expected) {
    Date date;
    utils.SystemTimeToDate(parts, date);
    EXPECT_EQ(to_utf8(date_to_text(date)), expected);
  });
  for (const SystemTime& bad : {SystemTime{-1, 1, 0, 1}, {9999, 13, 0, 1}, {100, 1, 0, 0}, {32767, 1, 0, 1}}) {
    Date date{7};
    EXPECT_EQ(error_of([&] { utils.SystemTimeToDate(bad, date); }), 5) << bad.wYear;
    EXPECT_EQ(date, Date{7});
  }
}

}  // namespace
}  // namespace talutil::testing
