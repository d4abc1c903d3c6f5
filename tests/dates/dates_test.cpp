#include "dates/week_tables.hpp"
#include "tests/fakes/late_members.hpp"
#include "tests/fakes/recording_control.hpp"

namespace talutil::testing {
namespace {

using DateMembers = LateMembers;

// clang-format off
TEST_F(DateMembers, Calendar) {
  check({
    {u"GetYear", {{u"", "2000"}, {u"@empty", "2000"}, {u"5/3/0100", "100"},
     {u"31/12/9999 23:59", "9999"}, {u"1/1/10000", "error 13"}, {u"=3000000", "error 6"}, {u"@error", "error 13"}}},
    {u"GetMonth", {{u"@null", "1"}, {u"5/3/2009", "3"}, {u"12/31/2009", "12"}}},
    {u"GetDay", {{u"", "1"}, {u"=39877.9", "5"}, {u"#29/12/1899 06:00#", "29"}, {u"31/2/2009", "error 13"}}},
    {u"GetDaysThisMonth", {{u"2|1900", "28"}, {u"2|2000", "29"}, {u"0|2008", "28"}, {u"5|0", "28"},
     {u"13|2008", "error 9"}, {u"-1|2008", "error 9"}, {u"13|0", "28"}, {u"2|-4", "29"}}},
    {u"SetDayOfMonth", {{u"5/3/2009 17:00|9", "09/03/2009"}, {u"5/2/2009|31", "31/2/2009"}, {u"5/2/2009|0", "0/2/2009"},
     {u"5/2/2009|-1", "-1/2/2009"}, {u"@null|1", "error 94"}, {u"|1", "error 13"}}},
    {u"GetFinancialYearStr", {{u"15/03/2010", "0910"}, {u"01/07/2009", "0910"}, {u"01/07/1999", "99100"},
     {u"01/03/2000", "-100"}, {u"@null", "error 13"},
     {u"soon", "error 13"}}},
    {u"GetDateFromString", {{u"29022008", "29/02/2008"}, {u"29022009", ""}, {u"1234567", ""}, {u"3l122008", ""},
     {u"31122101", ""}, {u"31122100", "31/12/2100"}, {u"31121899", ""}, {u"00012000", ""}, {u"01132000", ""},
     {u"010120001", ""}}},
    {u"VerifyNullTime", {{u"0|14:05:59", "14:05"}, {u"0|24:00", "01:30"}, {u"1|=0.5", "01:30"},
     {u"7|5/3/2009", "00:00"}, {u"0|@error", "01:30"}}},
    {u"VerifyNullDate", {{u"0|5/3/2009 13:45", "05/03/2009"}, {u"2|05/03/2009 13:45", "05/03/2009 13:45"},
     {u"4|05/03/2009", "05032009"}, {u"9|#5/3/2009#", "05/03/2009"}, {u"1|", "#01/01/1980#"},
     {u"4|@empty", "#01/01/1980#"}, {u"0|@error", "#01/01/1980#"},
     {u"0|=39877", "#01/01/1980#"}, {u"0|12/12/1975", "#01/01/1980#"}, {u"2|31/2/2009", "#01/01/1980#"},
     {u"3|01/01/1980", "#01/01/1980#"}, {u"0|00:00:00", "#01/01/1980# | 01/01/1980"}, {u"0|00:00", "#01/01/1980#"},
     {u"0|01/01/1980 09:00", ""}, {u"1|01/01/1980 09:00", "01/01/1980"}, {u"2|01/01/1980 09:00", "01/01/1980 09:00"},
     {u"4|01/01/1980 09:00", ""}, {u"2|01/01/1980 00:00:20", ""}, {u"3|01/01/1980 09:00", "06/07/2009 12:00"},
     {u"3|02/01/1980", "02/01/1980"}}},
  });
}

TEST_F(DateMembers, Weeks) {
  check({
    {u"GetWeekNumber", {{u"7/1/2009", "1"}, {u"8/1/2009 10:00", "2"}, {u"24/12/2009", "52"}, {u"23/12/2009", "51"},
     {u"31/12/2008", "52"}, {u"@null", "1"}, {u"", "1"}, {u"29/2/2009", "error 13"}, {u"1/1/0100", "1"}}},
    {u"WeekYearToDate", {{u"1|2009|1", "#01/01/2009#"}, {u"52|2009|2", "#31/12/2009#"},
     {u"60|2009|1", "#24/12/2009# | 52"}, {u"0|2009|2", "#07/01/2009# | 1"}, {u"-9|2009|3", "Empty | 1"},
     {u"1|2009|0", "08/01/2009"}, {u"52|2008|0", "30/12/2008"}, {u"10|2008|1", "#05/03/2008#"},
     {u"51|2008|2", "#23/12/2008#"}, {u"1|9|1", "#01/01/2009#"}, {u"1|0|0", "08/01/2000"}, {u"1|-1|1", "error 13"},
     {u"99|10000|0", "error 13 | 52"}, {u"1|10000|7", "Empty"}}},
    {u"GetWeekInDateRange", {{u"01/03/2009|31/01/2009|1|2009", "True"}, {u"01/03/2009|07/01/2009|1|2009", "False"},
     {u"31/01/2009|01/03/2009|1|2009", "True"}, {u"08/01/2009|01/01/2009|1|2009", "True"},
     {u"09/01/2009|07/01/2009|0|2009", "False | 1"}, {u"x|07/01/2009|1|2009", "error 13"},
     {u"1/1/2009|@null|1|2009", "error 94"}}},
  });
}

TEST_F(DateMembers, Stepping) {
  check({
    {u"IncDay", {{u"5/3/2009 17:00|0", "05/03/2009"}, {u"5/3|0", "05/03/2009"}, {u"5/3/2009|-32768", "error 6"},
     {u"31/12/9999|1", "1/1/10000"},
     {u"01/01/0100|-1", "31/12/1999"}, {u"31/2/2009|0", "error 13"}, {u"@null|0", "error 13"},
     {u"5/3/2009|40000", "error 6"}}},
    {u"IncWeek", {{u"25/02/2008|1", "03/03/2008"}, {u"25/02/2008|4681", "11/11/2097"}, {u"25/02/2008|-4682", "error 6"},
     {u"25/02/2008|4682", "error 6"}}},
    {u"IncMonth", {{u"31/12/2009|-32768", "error 6"}, {u"31/3/0100|-1204", "30/11/-1"}}},
    {u"IncYear", {{u"29/02/2008|4", "29/02/2012"}, {u"29/02/2008|-2008", "28/02/2000"},
     {u"1/1/2009|30758", "1/1/32767"}, {u"1/1/2009|30759", "error 6"}, {u"1/1/2009|-1910", "01/01/1999"}}},
    {u"GetNextDate", {{u"31/1/2009|Months|1", "28/02/2009"},
     {u"31/1/2009|Years|1", "31/01/2010"}, {u"31/1/2009|Yearly|-1", "31/01/2008"}, {u"31/1/2009|Weeks|1", "07/02/2009"},
     {u"31/1/2009|Weekly|2", "14/02/2009"}, {u"31/1/2009|Days|=1.5", "02/02/2009"},
     {u"31/1/2009|Daily|1", "01/02/2009"}, {u"x|@null|3", "30/12/1899"},
     {u"31/1/2009|Daily|x", "error 13"}, {u"31/1/2009|@null|40000", "error 6"},
     {u"31/12/9999|Yearly|1", "31/12/10000"}}},
    {u"AddTimeToDate", {{u"05/03/2009 17:00|9:05", "05/03/2009 09:05"}, {u"05/03/2009|9 pm", "05/03/2009 21:00"},
     {u"05/03/2009|24:00", "error 13"}, {u"29/2/2009|9:00", "error 13"}}},
  });
}

TEST_F(DateMembers, Durations) {
  check({
    {u"DateTimeToDuration", {{u"01/01/1800 01:30", "1:30"}, {u"#01/01/1800 00:05#", "0:5"},
     {u"31/12/1799 22:30", "-1:-30"}, {u"30/12/1899 01:30", "1:30 | 1/1/1800 01:30"},
     {u"#01:30:15#", "1:30 | 1/1/1800 01:30"}, {u"#00:00#", "0:0 | 1/1/1800 00:00"},
     {u"30/12/1899", "error 13 | 1/1/1800 /1899"}, {u"@null", "error 94"}, {u"31/12/9999", "error 6"}}},
    {u"DurationToDateTime", {{u"1:30", "#01/01/1800 01:30#"}, {u"#5/3/2009 23:59:59#", "#01/01/1800 23:59#"},
     {u"24:00", "#02/01/1800#"}, {u"7.5", "error 13"}, {u"26:x", "error 13"}, {u"1:100", "error 13"},
     {u"99999999999:0", "error 6"}, {u"=7.5", "#01/01/1800 12:00#"}, {u"@null", "error 13"}}},
    {u"ConvertDurationToNumber", {{u"01:10", "1"}, {u"00:15", "0.25"},
     {u"-2:30", "2.5"}, {u"24:00", "0"}, {u"@null", "0"}, {u"#02/01/1800 01:00#", "1"}}},
    {u"DurToTime", {{u" 1.75 ", "#01/01/1800 01:45# | 1.75"},
     {u"2", "#01/01/1800 02:00#"}, {u".25", "#01/01/1800 00:15#"}, {u"1.50", "#01/01/1800 01:50#"},
     {u"1.1", "#01/01/1800 01:01#"}, {u"1.99", "#01/01/1800 02:39#"}, {u" ", "error 13 | "},
     {u"25.5", "#02/01/1800 01:30#"}}},
    {u"ConvertDatabaseDurationToNumber", {{u"02/01/1800 01:00", "1"}, {u"02/01/1800", "24"}, {u"01/01/1800", "1.5"},
     {u"01/01/1800 08:05", "8"}, {u"01/01/1800 00:15", "0.25"}, {u"31/12/1799 22:30", "-0.5"},
     {u"1:30", "1.5 | 1/1/1800 1:30"}}},
    {u"ConvertNumberToDatabaseDuration", {{u"1439", "#01/01/1800 23:59#"},
     {u"1500", "#02/01/1800 01:00#"}, {u"-65", "#31/12/1799 22:55#"}}},
    {u"ConvertDatabaseDurationToMinutes", {{u"#01/01/1800 01:30#", "90"}, {u"#01:30#", "90 | 1/1/1800 01:30"},
     {u"=0.0625", "error 13 | 1/1/1800 .0625"}}},
    {u"ConvertTimeToMinutes", {{u"13:45", "825"}, {u"#5/3/2009 23:59:59#", "1439"}, {u"@empty", "0"},
     {u"24:00", "error 13"}}},
  });
}

TEST_F(DateMembers, Periods) {
  check({
    {u"GetDaysInPeriod", {{u"01/03/2024|01/03/2024 23:00", "0"}, {u"28/02/2024|#01/03/2024#", "2"},
     {u"x|@empty", "-1"}, {u"@null|01/03/2024", "error 13"},
     {u"30/2/2024|1/3/2024", "error 13"}, {u"1/1/0100|30/12/9999", "3615898"}, {u"30/12/9999|31/12/9999", "error 6"},
     {u"31/12/9999|31/12/9999", "0"}}},
    {u"GetMonthsInPeriod", {{u"10/03/2024|10/03/2024 09:00", "-1"}, {u"31/12/9999|01/12/9999", "error 6"},
     {u"1/1/2024|", "-1"}}},
    {u"GetTimeDifference", {{u"10/03/2024|10/03/2024|09:00|10:30", "1:30"},
     {u"10/3/2024|#11/03/2024 08:00#|#22:00:30#|2:00", "4:0 | 10/03/2024 | 11/03/2024 | 22:00 | 02:00"},
     {u"31/01/2024|01/02/2024|22:00|02:00", "-20:0"}, {u"10/03/2024|10/03/2024|10:30|09:00", "-1:-30"},
     {u"10/03/2024|10/03/2024|09:00|09:05", "0:5"}, {u"01/01/0100|31/12/9999|09:00|09:05", "error 6"},
     {u"1/1/2024|2/1/2024|x|9:05", "error 13 | 01/01/2024 | 02/01/2024"},
     {u"1/1/2024|@null|9:00|09:05", "error 13 | 01/01/2024"}}},
  });
}

TEST_F(DateMembers, Utc) {
  check({
    {u"LocalTimeToUTC", {{u"05/03/2009 13:45", "#05/03/2009 03:45#"}, {u"01/01/1500 12:00", "#01/01/1500 12:00#"},
     {u"29/2/2009", "error 13"}}},
    {u"UTCToLocalTime", {{u"#05/03/2009 03:45:30#", "#05/03/2009 13:45:30#"},
     {u"01/01/1500 12:00", "#01/01/1601 10:00#"}, {u"31/12/9999 20:00", "error 5"}}},
  });
}
// clang-format on

TEST_F(DateMembers, CountersCountEveryCallAndStopAtTheirEnd) {
  SharedSettings& settings = library.settings();
  check({{u"VerifyNullTime", {{u"0|@error", "01:30"}}}, {u"VerifyNullDate", {{u"0|@null", "#01/01/1980#"}}}});
  EXPECT_EQ(std::pair(settings.CounterVerifyTime, settings.CounterVerifyDate), std::pair(1, 1));
  settings.CounterVerifyTime = settings.CounterVerifyDate = 2147483647;
  check({{u"VerifyNullTime", {{u"0|13:45", "error 6"}}}, {u"VerifyNullDate", {{u"0|00:00:00", "error 6"}}}});
}

TEST_F(DateMembers, WeekTablesHaveTheCalendarOfTheCurrentYear) {
  platform.current_time = {39600};  // 1 June 2008
  check({{u"WeekYearToDate",
          {{u"10|2009|1", "#04/03/2009#"}, {u"9|2009|2", "#03/03/2009#"}, {u"52|2009|1", "#23/12/2009#"}}}});
  const WeekTables& weeks = library.part<WeekTables>();
  EXPECT_EQ(weeks.start(2) + weeks.end(52) + weeks.start(53) + weeks.end(53), u"08/01/200931/12/2009");
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

TEST_F(DateMembers, ObjectsStandForRecords) {
  const auto object = std::make_shared<RecordingControl>();
  object->values = {{"wYear", std::int16_t{2009}},   {"wMonth", std::int16_t{3}},       {"wDay", std::int16_t{31}},
                    {"wHour", std::int16_t{9}},      {"wMinute", std::int16_t{0}},      {"wSecond", std::int16_t{0}},
                    {"wDayOfWeek", std::int16_t{7}}, {"wMilliseconds", std::int16_t{8}}};
  const Variant holder = ObjectRef(object);
  const auto use = [&](TextView member, std::vector<Argument> arguments) {
    call(member, Access::call, arguments);
    return arguments[1].value;
  };
  EXPECT_EQ(use(u"SystemTimeToDate", {holder, Variant()}).to_text(plain_numbers), u"31/03/2009 09:00");
  EXPECT_EQ(use(u"DateToSystemTime", {Variant(u"5/3/2009 13:00"), holder}), holder);
  std::erase_if(object->uses, [](const std::string& entry) { return !entry.starts_with("put"); });
  EXPECT_EQ(object->uses, (std::vector<std::string>{"put wDay = 5%", "put wHour = 13%"}));
  EXPECT_EQ(error_of([&] { use(u"DateToSystemTime", {Variant(u"6/4/2010"), Variant()}); }), 13);
  const auto timeless = std::make_shared<RecordingControl>();
  timeless->values = {{"wYear", std::int16_t{2009}}, {"wMonth", std::int16_t{3}}, {"wDay", std::int16_t{31}}};
  EXPECT_EQ(error_of([&] { use(u"DateToSystemTime", {Variant(u"6/4/2010"), Variant(ObjectRef(timeless))}); }), 438);
}

/// A calendar in which every month has twenty days.
class ShortMonths final : public ORVUtils {
 public:
  using ORVUtils::ORVUtils;
  std::int16_t GetDaysThisMonth(const std::int16_t& /*iMonth*/, const std::int16_t& /*iYear*/) override { return 20; }
};

TEST_F(DateMembers, StepsGoByTheObjectsOwnMonths) {
  ShortMonths object(library);
  EXPECT_EQ(object.IncDay(u"19/01/2009", 2), Variant(u"01/02/2009"));
  EXPECT_EQ(object.IncDay(u"25/01/2009", 21), Variant(u"01/03/2009"));
  EXPECT_EQ(object.IncDay(u"01/03/2009", -21), Variant(u"20/01/2009"));
  EXPECT_EQ(object.IncMonth(u"31/01/2009", 1), Variant(u"20/02/2009"));
  // The week goes on to day 28 without asking.
  EXPECT_EQ(object.IncWeek(u"19/01/2009", 1), Variant(u"26/01/2009"));
  EXPECT_EQ(object.IncWeek(u"26/01/2009", 1), Variant(u"05/02/2009"));
}

TEST_F(DateMembers, SystemTimes) {
  SystemTime time{.wDayOfWeek = 77, .wMilliseconds = 88};
  utils.DateToSystemTime({39877.5732638889}, time);
  EXPECT_EQ(time, (SystemTime{2009, 3, 77, 5, 13, 45, 30, 88}));
  const Rows<SystemTime, std::string> rows = {
      {"parts as they are", time, "05/03/2009 13:45:30"},
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
