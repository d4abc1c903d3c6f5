#pragma once

#include <cstdint>

#include "automation/system_time.hpp"
#include "automation/variant.hpp"
#include "library/shared_settings.hpp"

namespace talutil {

class Library;

/// The common toolkit of a host: texts, dates, settings, files, dialogs and reports in one object. Objects have no
/// state of their own: settings belong to the loaded library, and all objects share them. Create one object, set what
/// the host needs, and call Terminate at the end. Values that cannot be converted to a parameter's type raise 13, 6
/// (out of range) or 94 (Null), in every member. Whatever a member has written back before an error stays written.
/// @example
///     Set u = CreateObject("TALUtil.ORVUtils")
///     Print u.VerifyTextData(0, 0, "Smith & Sons")
///     ' Smith and Sons
///     u.Terminate
class ORVUtils {
  // Members are in slot order. The signature defines the interface: `T` is passed by value, `const T&` by reference and
  // never changed, `T&` by reference and written back. Members call each other through the object, so that overriding
  // one affects the others. All run-time errors leave a member as RunTimeError.
  //
  // The doc comments are the members' texts for hosts: help, reference and help strings come from them. CONTRIBUTING.md
  // describes their form.
 public:
  explicit ORVUtils(Library& library) noexcept : library_(library) {}
  ORVUtils(const ORVUtils&) = delete;
  ORVUtils& operator=(const ORVUtils&) = delete;
  virtual ~ORVUtils() = default;

  [[nodiscard]] Library& library() const noexcept { return library_; }
  [[nodiscard]] SharedSettings& settings() const noexcept;
  [[nodiscard]] Locale locale() const;

  /// Ends the host's use of the library: closes its hidden components window, which it loads first if necessary. Call
  /// it once, last. With DebugMode exactly 1, the message "Closing ORVUtils Components form" is shown before.
  /// @family windows
  /// @reads DebugMode
  /// @example
  ///     u.Terminate
  virtual void Terminate();

  /// Cleans a value for a text field of the database. Trims blanks at both ends, cuts at the first NUL, replaces "&" by
  /// "and" and the apostrophe by an acute accent, and removes the double quote, tab, "#", ">", "<" and "?", so that a
  /// text can stand in an SQL statement. The width is applied last.
  /// @param iMaxTextLength the field's width in characters; 0 or less for no limit
  /// @param iExtras 1 also removes commas, 2 blanks, 3 both; 4 compresses the text to three lines; 5 drops lines with
  /// $*$; anything else does nothing more
  /// @param vData the value; Null and Empty give an empty text, a number its digits
  /// @raises 6 if CounterVerifyText is at its maximum
  /// @raises 13 if the value has no text form
  /// @changes CounterVerifyText
  /// @family text
  /// @see VerifyMemField, VerifyIntData, ConvertCase
  /// @example
  ///     Print u.VerifyTextData(0, 0, "  Smith & Sons, ""Painters"" #1  ")
  ///     ' Smith and Sons, Painters 1
  /// @example A field of ten characters without commas
  ///     Print u.VerifyTextData(10, 1, "Smith, Jones, Brown")
  ///     ' Smith Jone
  virtual Text VerifyTextData(const std::int16_t& iMaxTextLength, const std::int16_t& iExtras, const Variant& vData);

  /// The text before its first NUL character; the whole text if there is none. Buffers of fixed length that the system
  /// has filled end so.
  /// @param s the text
  /// @family strings
  /// @example
  ///     Print u.StripNulls("C:\TAL" & Chr(0) & "rubbish")
  ///     ' C:\TAL
  virtual Text StripNulls(const Text& s);

  /// Keeps the characters whose code is 65 ("A") or more: letters stay; digits, blanks and most punctuation go.
  /// @param sTemp the text
  /// @family strings
  /// @see RemoveStringsFromNumber, NumbersInString
  /// @example
  ///     Print u.RemoveNumberFromString("Unit 12, Main St")
  ///     ' UnitMainSt
  virtual Text RemoveNumberFromString(const Text& sTemp);

  /// Keeps the digits of a text, or all but one character.
  /// @param iOption 0 keeps digits, 1 digits and blanks, 2 everything but sCharacter, 3 digits and full stops; any
  /// other value gives an empty text
  /// @param sTemp the text
  /// @param sCharacter the character that option 2 removes; several characters remove nothing. With option 2, an empty
  /// text becomes a blank.
  /// @family strings
  /// @see RemoveNumberFromString, VerifyIntData
  /// @example
  ///     Print u.RemoveStringsFromNumber(0, "(07) 5550 1234", "")
  ///     ' 0755501234
  ///     Print u.RemoveStringsFromNumber(3, "$1,250.50", "")
  ///     ' 1250.50
  /// @example Blanks removed
  ///     character = ""
  ///     Print u.RemoveStringsFromNumber(2, "07 5550 1234", character)
  ///     ' 0755501234
  ///     Print "[" & character & "]"
  ///     ' [ ]
  virtual Text RemoveStringsFromNumber(const std::int16_t& iOption, const Text& sTemp, Text& sCharacter);

  /// Replaces each occurrence of one character by a text. Characters are compared by their codes in the system's code
  /// page.
  /// @param sSrc the text to search; an empty one is returned as it is
  /// @param sChr its first character is replaced
  /// @param sReplace what takes its place; may be empty
  /// @raises 5 if sChr is empty and sSrc is not
  /// @family strings
  /// @see StringReplaceWord, CRLFStringReplace
  /// @example
  ///     Print u.StringReplace("10-11-12", "-", " to ")
  ///     ' 10 to 11 to 12
  virtual Text StringReplace(const Text& sSrc, const Text& sChr, const Text& sReplace);

  /// The date moved to another day of its month, as text "DD/MM/YYYY". If the month has no such day, the text is not a
  /// date, but as first put together: "31/2/2009".
  /// @param vDate a date or the text of one
  /// @param iDayNumber the day
  /// @raises 13 if vDate is not a date
  /// @raises 94 if vDate is Null
  /// @family calendar
  /// @see GetDaysThisMonth
  /// @example
  ///     Print u.SetDayOfMonth("17/02/2009", 1)
  ///     ' 01/02/2009
  ///     Print u.SetDayOfMonth("17/02/2009", 31)
  ///     ' 31/2/2009
  virtual Variant SetDayOfMonth(const Variant& vDate, const std::int16_t& iDayNumber);

  /// The financial year of a date, from 1 July to 30 June, with two digits a year: 15/08/2009 gives "0910". Centuries
  /// do not wrap: 01/07/1999 gives "99100", and 01/03/2000 "-100".
  /// @param vDate a date or the text of one
  /// @raises 13 if vDate is not a date
  /// @family calendar
  /// @example
  ///     Print u.GetFinancialYearStr("15/08/2009")
  ///     ' 0910
  ///     Print u.GetFinancialYearStr("30/06/2009")
  ///     ' 0809
  virtual Text GetFinancialYearStr(const Variant& vDate);

  /// True if vFromDate is on or before a week's date, or vToDate is on or after it. So it is False only for a range
  /// that runs backwards around that date. The date is what WeekYearToDate gives for the week with iDay 0: the first
  /// day of the following week.
  /// @param vFromDate the first date
  /// @param vToDate the last date
  /// @param iWeek 1 to 52; any other number becomes the nearest of these.
  /// @param iYear the year of the week
  /// @raises 13 if vFromDate or vToDate is not a date, or the year is not valid
  /// @raises 94 for Null
  /// @family weeks
  /// @see WeekYearToDate
  /// @example
  ///     week = 10
  ///     Print u.GetWeekInDateRange("01/03/2009", "31/03/2009", week, 2009)
  ///     ' True
  ///     Print u.GetWeekInDateRange("13/03/2009", "11/03/2009", week, 2009)
  ///     ' False
  virtual Boolean GetWeekInDateRange(const Variant& vFromDate, const Variant& vToDate, std::int16_t& iWeek,
                                     const std::int16_t& iYear);

  /// The text between two commas of a list, counted from 1; the list must end with a comma. The text behind the last
  /// comma is never returned. A comma that is missing, or a negative iSt, gives an empty text.
  /// @param sSrcStr the list
  /// @param iSt the comma before the text; 0 for the beginning of the list
  /// @param iEn the comma behind it
  /// @raises 5 if the iEn-th comma does not come after the iSt-th
  /// @family strings
  /// @see ReadCommaDelimStrToList, SubStrCount, MyInstrDelim
  /// @example
  ///     Print u.GetData("red,green,blue,", 0, 1)
  ///     ' red
  ///     Print u.GetData("red,green,blue,", 1, 3)
  ///     ' green,blue
  virtual Text GetData(const Text& sSrcStr, const std::int32_t& iSt, const std::int32_t& iEn);

  /// A time of day as text "HH:MM"; "01:30" if vTime is not a date or time.
  /// @param iFlag not used
  /// @param vTime a time, a date with a time, or the text of one
  /// @raises 6 if CounterVerifyTime is at its maximum; nothing else is raised
  /// @changes CounterVerifyTime
  /// @family calendar
  /// @see VerifyNullDate
  /// @example
  ///     Print u.VerifyNullTime(0, "9:5")
  ///     ' 09:05
  ///     Print u.VerifyNullTime(0, Null)
  ///     ' 01:30
  virtual Variant VerifyNullTime(const std::int16_t& iFlag, const Variant& vTime);

  /// A date as screens show it, as text; a missing date is 01/01/1980. If vDate is not a date, is midnight of
  /// 01/01/1980 or is earlier, the result is the date (not text) 01/01/1980. During the rest of that day the text is
  /// empty, except in modes 1 to 3.
  /// @param iFlag 1 shows 01/01/1980 during that day, 2 shows "DD/MM/YYYY HH:MM", 3 shows the current date and time
  /// during that day, 4 shows "DDMMYYYY"; anything else shows "DD/MM/YYYY"
  /// @param vDate a date or the text of one; the text "00:00:00" becomes "01/01/1980".
  /// @raises 6 if CounterVerifyDate is at its maximum; nothing else is raised
  /// @changes CounterVerifyDate
  /// @family calendar
  /// @see VerifyNullTime, docs/dates.md
  /// @example
  ///     d = "5/3/2009 14:30"
  ///     Print u.VerifyNullDate(0, d)
  ///     ' 05/03/2009
  ///     Print u.VerifyNullDate(2, d)
  ///     ' 05/03/2009 14:30
  ///     Print u.VerifyNullDate(4, d)
  ///     ' 05032009
  /// @example A missing date
  ///     d = Null
  ///     Print u.GetYear(u.VerifyNullDate(0, d))
  ///     ' 1980
  virtual Variant VerifyNullDate(const std::int16_t& iFlag, Variant& vDate);

  /// The week of a date, 1 to 52: the first seven days of the year are week 1, all days after week 51 are week 52.
  /// @param vDate a date or the text of one; Null and an empty text give 1
  /// @raises 13 if vDate is not a date
  /// @family weeks
  /// @see WeekYearToDate
  /// @example
  ///     Print u.GetWeekNumber("08/01/2009")
  ///     ' 2
  ///     Print u.GetWeekNumber("31/12/2009")
  ///     ' 52
  virtual std::int16_t GetWeekNumber(const Variant& vDate);

  /// A date in a week: its first day, its last day, or the day after it. The first and last days are laid out by the
  /// calendar of the current year (common or leap), whatever iYear is.
  /// @param iWeek 1 to 52; any other number becomes the nearest of these.
  /// @param iYear the year
  /// @param iDay 1 gives the first day and 2 the last (of week 52, 31 December), as dates; 0 gives the first day of the
  /// following week, as text "DD/MM/YYYY", by the calendar of iYear; any other gives Empty
  /// @raises 13 if the year is not valid
  /// @family weeks
  /// @see GetWeekNumber, GetWeekInDateRange
  /// @example
  ///     week = 10
  ///     Print u.WeekYearToDate(week, 2009, 0)
  ///     ' 12/03/2009
  /// @example A week beyond the last
  ///     week = 60
  ///     Print u.GetMonth(u.WeekYearToDate(week, 2009, 2))
  ///     ' 12
  ///     Print week
  ///     ' 52
  virtual Variant WeekYearToDate(std::int16_t& iWeek, const std::int16_t& iYear, const std::int16_t& iDay);

  /// The year of a date; 2000 for Null and for an empty text.
  /// @param vDate a date or the text of one
  /// @raises 13 if vDate is not a date
  /// @family calendar
  /// @see GetMonth, GetDay
  /// @example
  ///     Print u.GetYear("31/03/2009")
  ///     ' 2009
  ///     Print u.GetYear(Null)
  ///     ' 2000
  virtual std::int16_t GetYear(const Variant& vDate);

  /// The month of a date, 1 to 12; 1 for Null and for an empty text.
  /// @param vDate a date or the text of one
  /// @raises 13 if vDate is not a date
  /// @family calendar
  /// @see GetYear, GetDay
  /// @example
  ///     Print u.GetMonth("31/03/2009")
  ///     ' 3
  virtual std::int16_t GetMonth(const Variant& vDate);

  /// The day of a date in its month, 1 to 31; 1 for Null and for an empty text.
  /// @param vDate a date or the text of one
  /// @raises 13 if vDate is not a date
  /// @family calendar
  /// @see GetYear, GetMonth, SetDayOfMonth
  /// @example
  ///     Print u.GetDay("31/03/2009")
  ///     ' 31
  virtual std::int16_t GetDay(const Variant& vDate);

  /// True for an address with an "@" and a full stop anywhere, in any order, and for an empty one.
  /// @param sTemp the address
  /// @family checks
  /// @example
  ///     Print u.VerifyEmail("anne@example.com")
  ///     ' True
  ///     Print u.VerifyEmail("anne at example")
  ///     ' False
  ///     Print u.VerifyEmail("")
  ///     ' True
  virtual Boolean VerifyEmail(const Text& sTemp);

  /// True if a point is strictly inside a rectangle, not on its edge. False if an argument is Null. Texts are compared
  /// as texts, character by character, and a number is less than any text: pass numbers.
  /// @param lngSrcX the point, across
  /// @param lngSrcY the point, down
  /// @param lngDestX1 the left edge
  /// @param lngDestY1 the top edge
  /// @param lngDestX2 the right edge
  /// @param lngDestY2 the bottom edge
  /// @raises 13 for values that cannot be compared
  /// @family drawing
  /// @example
  ///     Print u.GetMousePos(5, 5, 0, 0, 10, 10)
  ///     ' True
  ///     Print u.GetMousePos(0, 5, 0, 0, 10, 10)
  ///     ' False
  virtual Boolean GetMousePos(const Variant& lngSrcX, const Variant& lngSrcY, const Variant& lngDestX1,
                              const Variant& lngDestY1, const Variant& lngDestX2, const Variant& lngDestY2);

  /// The number of pages that rows need. Counted in single precision, and so inexact above 16777216 pages.
  /// @param iRowsPerPage the rows on a page
  /// @param iRowCount the rows
  /// @raises 11 if iRowsPerPage is 0
  /// @family reports
  /// @example
  ///     Print u.GetMaxPages(40, 81)
  ///     ' 3
  virtual std::int32_t GetMaxPages(const std::int32_t& iRowsPerPage, const std::int32_t& iRowCount);

  /// The index of the first element that begins with a text, ignoring case; -1 if there is none.
  /// @param sFList a list of texts; the search starts at index 0 whatever its lower bound is
  /// @param sText the text; an empty one matches element 0
  /// @raises 9 if the list's lower bound is above 0, or the list is not allocated
  /// @family strings
  /// @see ReadCommaDelimStrToList
  /// @example
  ///     list = Array("Apple", "Banana", "Cherry")
  ///     Print u.IndexInList(list, "ban")
  ///     ' 1
  ///     Print u.IndexInList(list, "grape")
  ///     ' -1
  virtual std::int32_t IndexInList(const TextArray& sFList, const Text& sText);

  /// The position, from 1, of a given occurrence of a character; 0 if there are fewer. The count is checked after every
  /// character, matching or not, so an iCount of 0 gives 1 unless the first character matches.
  /// @param s1 the character
  /// @param s2 the text to search
  /// @param iCount which occurrence, from 1
  /// @family strings
  /// @see SubStrCount, GetData
  /// @example
  ///     Print u.MyPos(",", "red,green,blue,", 2)
  ///     ' 10
  ///     Print u.MyPos(",", "red,green,blue,", 4)
  ///     ' 0
  virtual std::int32_t MyPos(const Text& s1, const Text& s2, const std::int32_t& iCount);

  /// The number of occurrences of a character in a text; 0 if sSubStr is not exactly one character.
  /// @param sSubStr the character
  /// @param sSrcStr the text to search
  /// @family strings
  /// @see MyPos
  /// @example
  ///     Print u.SubStrCount(",", "red,green,blue,")
  ///     ' 3
  virtual std::int32_t SubStrCount(const Text& sSubStr, const Text& sSrcStr);

  /// The number of days in a month, 28 to 31; 28 if the month or the year is 0.
  /// @param iMonth 1 to 12
  /// @param iYear the year
  /// @raises 9 for a month outside 1 to 12
  /// @family calendar
  /// @example
  ///     Print u.GetDaysThisMonth(2, 2008)
  ///     ' 29
  virtual std::int16_t GetDaysThisMonth(const std::int16_t& iMonth, const std::int16_t& iYear);

  /// Splits a list that ends with its delimiter into an array, from index 0, and returns the number of elements. The
  /// text behind the last delimiter is dropped. If there is no delimiter, or the list is empty, the result is 0 and the
  /// array stays as it was.
  /// @param sTemp the list
  /// @param sFList receives the elements.
  /// @param sDelimiter the delimiter, one character
  /// @raises 9 for an array whose lower bound is above 0
  /// @family strings
  /// @see GetData, IndexInList
  /// @example
  ///     list = Empty
  ///     Print u.ReadCommaDelimStrToList("red,green,blue,", list)
  ///     ' 3
  ///     Print list(2)
  ///     ' blue
  /// @example Another delimiter
  ///     list = Empty
  ///     Print u.ReadCommaDelimStrToList("10;20;rest", list, ";")
  ///     ' 2
  virtual std::int32_t ReadCommaDelimStrToList(const Text& sTemp, TextArray& sFList, const Text& sDelimiter);

  /// The number at the start of a value, as text: "12abc" gives "12"; "0" if there is none.
  /// @param iFlag 1 gives "0" for Null, anything else an empty text
  /// @param vData the value
  /// @raises 6 if CounterVerifyInt is at its maximum, and for a number beyond the range of a double
  /// @changes CounterVerifyInt
  /// @family text
  /// @see VerifyTextData, IsValueNumber
  /// @example
  ///     Print u.VerifyIntData(0, "3.50kg")
  ///     ' 3.5
  ///     Print u.VerifyIntData(0, "kg")
  ///     ' 0
  ///     Print u.VerifyIntData(1, Null)
  ///     ' 0
  virtual Text VerifyIntData(const std::int16_t& iFlag, const Variant& vData);

  /// True for a text of digits and full stops only. "1.2.3" and "." pass; a sign, a blank, a comma or an empty text
  /// does not.
  /// @param sText the text
  /// @family checks
  /// @see VerifyIntData
  /// @example
  ///     Print u.IsValueNumber("12.50")
  ///     ' True
  ///     Print u.IsValueNumber("-12")
  ///     ' False
  virtual Boolean IsValueNumber(const Text& sText);

  /// True for a text of the form day/month/year, in digits, with "/" or "-" in between. Ranges are not checked:
  /// 99/99/9999 passes. A two-digit day with a one-digit month does not (12/3/2024), as hosts have always seen it.
  /// @param sText the text
  /// @family checks
  /// @see IsValueTime, GetDateFromString
  /// @example
  ///     Print u.IsValueDate("31/03/2009")
  ///     ' True
  ///     Print u.IsValueDate("12/3/2009")
  ///     ' False
  virtual Boolean IsValueDate(const Text& sText);

  /// True for one or two digits of hours, ":" and minutes. Ranges are not checked, and seconds do not pass.
  /// @param sText the text
  /// @family checks
  /// @see IsValueDate
  /// @example
  ///     Print u.IsValueTime("9:30")
  ///     ' True
  ///     Print u.IsValueTime("09:30:00")
  ///     ' False
  virtual Boolean IsValueTime(const Text& sText);

  /// Replaces each carriage return and each line feed by a text; a line break becomes two copies of it.
  /// @param sSrc the text
  /// @param sReplace what takes their place
  /// @family strings
  /// @see StringRestoreCRLF
  /// @example
  ///     Print u.CRLFStringReplace("one" & vbCrLf & "two", "|")
  ///     ' one||two
  virtual Text CRLFStringReplace(const Text& sSrc, const Text& sReplace);

  /// Reverses CRLFStringReplace for a marker of one character: each marker and the character after it become a line
  /// break. A marker at the very end adds a line break and stays itself.
  /// @param sSrc the text with markers
  /// @param sSourceCharacter the marker
  /// @raises 6 for a text beyond 32767 characters
  /// @family strings
  /// @see CRLFStringReplace
  /// @example
  ///     Print u.StringRestoreCRLF("one||two", "|")
  ///     ' one
  ///     ' two
  virtual Text StringRestoreCRLF(const Text& sSrc, const Text& sSourceCharacter);

  /// Pads a text with "0" to a length; a text that is long enough stays as it is.
  /// @param sText the text
  /// @param iExpLength the length
  /// @param iJustify -1 pads before the text, 1 behind it; anything else not at all
  /// @family strings
  /// @example
  ///     Print u.AddZeros("7", 3, -1)
  ///     ' 007
  ///     Print u.AddZeros("7", 3, 1)
  ///     ' 700
  virtual Text AddZeros(const Text& sText, const std::int16_t& iExpLength, const std::int16_t& iJustify);

  /// The hours and minutes between two dates and times, as text "1:30"; both are negative if the second is earlier:
  /// "-1:-30". Days count only if the text of the end date sorts after that of the start date: 31/01/2024 to 01/02/2024
  /// counts none. The arguments are rewritten in their order, until one cannot be read.
  /// @param vStDate the first date; becomes text "DD/MM/YYYY".
  /// @param vEnDate the second date; becomes text "DD/MM/YYYY".
  /// @param vStTime the first time; becomes text "HH:MM".
  /// @param vEnTime the second time; becomes text "HH:MM".
  /// @raises 13 if an argument is not a date or time
  /// @raises 6 beyond 32 bits of minutes
  /// @family durations
  /// @see ConvertTimeToMinutes
  /// @example
  ///     first = "10/3/2024"
  ///     last = "11/3/2024"
  ///     from_time = "22:00"
  ///     to_time = "2:00"
  ///     Print u.GetTimeDifference(first, last, from_time, to_time)
  ///     ' 4:0
  ///     Print last & " " & to_time
  ///     ' 11/03/2024 02:00
  virtual Variant GetTimeDifference(Variant& vStDate, Variant& vEnDate, Variant& vStTime, Variant& vEnTime);

  /// The date some years later, as text "DD/MM/YYYY"; 29 February becomes the 28th in common years. A year below 100 is
  /// expanded like a two-digit year, and a year beyond 9999 results in a text that is not a date.
  /// @param vSrcDate a date or the text of one
  /// @param iNum the number of years; negative for earlier
  /// @raises 13 if vSrcDate is not a date
  /// @raises 6 for a year beyond 16 bits
  /// @family stepping
  /// @see IncMonth, IncWeek, IncDay, GetNextDate
  /// @example
  ///     Print u.IncYear("29/02/2008", 1)
  ///     ' 28/02/2009
  virtual Variant IncYear(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The number of days between two dates, in either order, ignoring times of day; -1 if either is empty.
  /// @param vStartDate a date or the text of one
  /// @param vEndDate another
  /// @raises 13 if an argument is not a date, or is Null
  /// @raises 6 if one of two different dates is 31/12/9999
  /// @family periods
  /// @see GetMonthsInPeriod
  /// @example
  ///     Print u.GetDaysInPeriod("01/03/2009", "31/03/2009")
  ///     ' 30
  ///     Print u.GetDaysInPeriod("01/03/2009", "")
  ///     ' -1
  virtual std::int32_t GetDaysInPeriod(const Variant& vStartDate, const Variant& vEndDate);

  /// The number of month boundaries between two dates, in either order; -1 for equal dates, and if either is empty.
  /// @param vStartDate a date or the text of one
  /// @param vEndDate another
  /// @raises 13 if an argument is not a date, or is Null
  /// @raises 6 if one of two different dates is 31/12/9999
  /// @family periods
  /// @see GetDaysInPeriod
  /// @example
  ///     Print u.GetMonthsInPeriod("31/01/2009", "01/03/2009")
  ///     ' 2
  ///     Print u.GetMonthsInPeriod("31/01/2009", "31/01/2009")
  ///     ' -1
  virtual std::int32_t GetMonthsInPeriod(const Variant& vStartDate, const Variant& vEndDate);

  /// The date some days later, as text "DD/MM/YYYY". Years below 100 and beyond 9999 are treated as IncYear does.
  /// @param vSrcDate a date or the text of one
  /// @param iNum the number of days; negative for earlier
  /// @raises 13 if vSrcDate is not a date
  /// @raises 6 for -32768 days
  /// @family stepping
  /// @see IncWeek, IncMonth, IncYear, GetNextDate
  /// @example
  ///     Print u.IncDay("28/02/2008", 2)
  ///     ' 01/03/2008
  virtual Variant IncDay(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The day of a date at a time of day, as text "DD/MM/YYYY HH:MM"; any time that the date has is replaced.
  /// @param vSrcDate a date or the text of one
  /// @param sTime the text of a time
  /// @raises 13 if an argument is not a date or time
  /// @family calendar
  /// @example
  ///     Print u.AddTimeToDate("31/03/2009 08:00", "14:30")
  ///     ' 31/03/2009 14:30
  virtual Variant AddTimeToDate(const Variant& vSrcDate, const Text& sTime);

  /// The date some weeks later, as text "DD/MM/YYYY": IncDay by seven times the number.
  /// @param vSrcDate a date or the text of one
  /// @param iNum the number of weeks, -4681 to 4681; negative for earlier
  /// @raises 13 if vSrcDate is not a date
  /// @raises 6 for a number outside that range
  /// @family stepping
  /// @see IncDay, IncMonth, IncYear, GetNextDate
  /// @example
  ///     Print u.IncWeek("31/03/2009", 1)
  ///     ' 07/04/2009
  virtual Variant IncWeek(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The date some months later, as text "DD/MM/YYYY", on the same day of the month or its last.
  /// @param vSrcDate a date or the text of one
  /// @param iNum the number of months; negative for earlier
  /// @raises 13 if vSrcDate is not a date
  /// @raises 6 for -32768 months
  /// @family stepping
  /// @see IncDay, IncWeek, IncYear, GetNextDate
  /// @example
  ///     Print u.IncMonth("31/03/2009", -1)
  ///     ' 28/02/2009
  virtual Variant IncMonth(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The date one step of a repetition later, as text "DD/MM/YYYY".
  /// @param vStartDate a date or the text of one
  /// @param vStep "Years" or "Yearly", "Months" or "Monthly", "Weeks" or "Weekly", "Days" or "Daily", exactly so; any
  /// other word gives "30/12/1899", without an error
  /// @param vIncrement the number of years, months, weeks or days, as a 16-bit integer
  /// @raises 6 if the increment is beyond 16 bits, and as IncYear, IncMonth, IncWeek and IncDay do
  /// @raises 13 if vStartDate is not a date, or vIncrement not a number
  /// @raises 94 if the increment is Null
  /// @family stepping
  /// @see IncYear, IncMonth, IncWeek, IncDay
  /// @example
  ///     Print u.GetNextDate("31/01/2009", "Monthly", 1)
  ///     ' 28/02/2009
  ///     Print u.GetNextDate("31/01/2009", "Weeks", 2)
  ///     ' 14/02/2009
  ///     Print u.GetNextDate("31/01/2009", "monthly", 1)
  ///     ' 30/12/1899
  virtual Variant GetNextDate(const Variant& vStartDate, const Variant& vStep, const Variant& vIncrement);

  /// Shows what a code means that the platform's function for starting programs has returned. The codes 0, 2, 3, 5, 6,
  /// 8, 10 to 16 and 19 to 21 have a message; for others, successful ones among them, nothing is shown.
  /// @param lRetVal the code
  /// @family windows
  /// @example A program that was started: nothing is shown
  ///     u.DrawShellExecuteError 42
  /// @example windows
  ///     ' The user presses: Return
  ///     u.DrawShellExecuteError 2
  virtual void DrawShellExecuteError(const std::int32_t& lRetVal);

  /// Asks the user to type YES, in capitals, before a record is deleted; True if they do. Anything else, cancelling the
  /// box included, shows a warning, from which the user can return to the box (Yes) or give up (No: False). Where there
  /// is nobody to ask, the result is False.
  /// @family input box
  /// @see CheckModifyDatabase, MyInputBox
  /// @example windows
  ///     ' The user types: YES
  ///     Print u.CheckDeleteRecord()
  ///     ' True
  virtual Boolean CheckDeleteRecord();

  /// Asks the user to type YES, in capitals, before the database is changed; True if they do. Behaves like
  /// CheckDeleteRecord, with other texts.
  /// @param sCaption the title of the box
  /// @family input box
  /// @see CheckDeleteRecord, MyInputBox
  /// @example windows
  ///     ' The user types: YES
  ///     Print u.CheckModifyDatabase("Renumber all jobs")
  ///     ' True
  virtual Boolean CheckModifyDatabase(const Text& sCaption);

  /// A name in the case style of iCharactercase: 1 name case, 2 lower, 3 upper, anything else unchanged. The value is
  /// first cleaned by VerifyTextData. It is returned as it was if it contains "machinery", is empty or Null, or is not
  /// to be converted.
  /// @param iFlag 1 for name case whatever the style is, unless that is 0 or less
  /// @param vStr the name
  /// @raises 6 if CounterVerifyText is at its maximum
  /// @raises 13 if the value has no text form
  /// @reads iCharactercase
  /// @changes CounterVerifyText
  /// @family text
  /// @see ConvertCaseSuburbs, docs/name-case.md
  /// @example
  ///     u.iCharactercase = 1
  ///     Print u.ConvertCase(0, "MARY SMITH-JONES")
  ///     ' Mary Smith-Jones
  ///     u.iCharactercase = 3
  ///     Print u.ConvertCase(0, "Mary Smith-Jones")
  ///     ' MARY SMITH-JONES
  ///     Print u.ConvertCase(1, "MARY SMITH-JONES")
  ///     ' Mary Smith-Jones
  virtual Variant ConvertCase(const std::int16_t& iFlag, const Variant& vStr);

  /// A suburb in the case style of iCharacterCaseSuburbs: 1 name case, 3 upper, anything else (2, too) unchanged. The
  /// value is first cleaned by VerifyTextData. Unlike ConvertCase, it converts names of machinery as well.
  /// @param vStr the suburb
  /// @raises 6 if CounterVerifyText is at its maximum
  /// @raises 13 if the value has no text form
  /// @reads iCharacterCaseSuburbs
  /// @changes CounterVerifyText
  /// @family text
  /// @see ConvertCase, docs/name-case.md
  /// @example
  ///     u.iCharacterCaseSuburbs = 3
  ///     Print u.ConvertCaseSuburbs("New Farm")
  ///     ' NEW FARM
  virtual Variant ConvertCaseSuburbs(const Variant& vStr);

  /// Shows the list of the host's shortcut keys, above all other windows, and returns at once. If the window is already
  /// open, it comes to the front.
  /// @raises 445 where there is no screen
  /// @family information windows
  /// @see ShowCmdLineHelp, docs/windows.md
  /// @example windows
  ///     u.ShowShortCutKeys
  virtual void ShowShortCutKeys();

  /// Shows the host's command-line switches, with examples, until the user closes the window.
  /// @raises 445 where there is no screen
  /// @family information windows
  /// @see ShowShortCutKeys, docs/windows.md
  /// @example windows
  ///     ' The user presses: Escape
  ///     u.ShowCmdLineHelp
  virtual void ShowCmdLineHelp();

  /// A random password from one of four mixes of characters. Two successive characters are never equal, and the first
  /// and the last character of each mix are half as frequent as the others. Waiting messages are handled before each
  /// draw, so that the host can call the library meanwhile.
  /// @param iMaxLength the number of characters; 0 or less gives an empty text
  /// @param iMix 0 decimal digits, 1 letters and symbols, 2 depends on iHex; anything else gives an empty text
  /// @param iHex with iMix 2: 0 letters, symbols and digits, 1 hexadecimal digits. With any other value the second
  /// character is never found: the call handles messages until the thread is asked to quit.
  /// @raises 18 if the thread is asked to quit during such a call
  /// @family passwords
  /// @see VerifyPasswordText
  /// @example
  ///     secret = u.GenerateFilePassword(12, 0, 0)
  ///     Print Len(secret) & " " & u.IsValueNumber(secret)
  ///     ' 12 True
  ///     Print Len(u.GenerateFilePassword(0, 0, 0))
  ///     ' 0
  virtual Text GenerateFilePassword(const std::int16_t& iMaxLength, const std::int16_t& iMix, const std::int16_t& iHex);

  /// True if a normal file matches a path; hidden files, system files and folders are not found. Never fails.
  /// @param sFilename the path; wildcards are allowed in its last part, and quotes around it are ignored
  /// @family files
  /// @see PathExists, GetFileCount
  /// @example
  ///     u.SaveTextBox "a line", folder & "\notes.txt"
  ///     Print u.FileExists(folder & "\notes.txt")
  ///     ' True
  ///     Print u.FileExists(folder & "\*.doc")
  ///     ' False
  virtual Boolean FileExists(Text sFilename);

  /// The part of a path after its last backslash, or after a drive's colon. Never fails.
  /// @param vSpecIn the path; quotes around it are removed.
  /// @param bIncludeExt False cuts the name at its first dot
  /// @family files
  /// @see ExtractPathName
  /// @example
  ///     path = "C:\TAL\report.final.txt"
  ///     Print u.ExtractFilename(path)
  ///     ' report.final.txt
  ///     Print u.ExtractFilename(path, False)
  ///     ' report
  virtual Text ExtractFilename(Text& vSpecIn, const Boolean& bIncludeExt);

  /// Copies a text file line by line, at most 30000 lines, to another file, which is replaced; every line ends in CR
  /// LF.
  /// @param sSrcFileName the file to copy
  /// @param sDestFileName the copy
  /// @raises 9 if the source is missing or has no lines
  /// @raises 76 if a folder is missing
  /// @raises 75 if the copy is read-only
  /// @raises 70 if a file is locked
  /// @raises 61 if the disk is full
  /// @family text files
  /// @example
  ///     u.SaveTextBox "a line", folder & "\notes.txt"
  ///     u.CopyFileToBackupFile folder & "\notes.txt", folder & "\notes.bak"
  ///     Print u.FileExists(folder & "\notes.bak")
  ///     ' True
  virtual void CopyFileToBackupFile(const Text& sSrcFileName, const Text& sDestFileName);

  /// Writes a list of texts to a file, one per line, which replaces it. After an error an existing file is as it was.
  /// @param sFList the texts, from index 0 to the last
  /// @param sFilename the file
  /// @raises 9 if the list's lower bound is above 0, or the list is not allocated
  /// @raises 76 if the folder is missing
  /// @raises 75 if the file is read-only
  /// @raises 70 if it is locked
  /// @raises 61 if the disk is full
  /// @family text files
  /// @see OpenBigFile, SaveTextBox
  /// @example
  ///     u.SaveBigFile Array("one", "two", "three"), folder & "\list.txt"
  ///     list = Empty
  ///     Print u.OpenFile(folder & "\list.txt", list, 0)
  ///     ' 3
  virtual void SaveBigFile(const TextArray& sFList, const Text& sFilename);

  /// The number of normal files that match a pattern in a folder; 0 for a missing folder.
  /// @param sPath the folder, with a trailing backslash
  /// @param sFiles the pattern; an empty one is "*.*"
  /// @raises 52 if the pattern is not valid
  /// @family files
  /// @see GetFileList, FileExists
  /// @example
  ///     u.SaveTextBox "one", folder & "\a.txt"
  ///     u.SaveTextBox "two", folder & "\b.txt"
  ///     Print u.GetFileCount(folder & "\", "*.txt")
  ///     ' 2
  virtual std::int32_t GetFileCount(const Text& sPath, const Text& sFiles);

  /// The names of the normal files that match a pattern in a folder, as a list in the system's order.
  /// @param sDelimiter stands behind each name; if it is one character, it is left out at the end
  /// @param sPath the folder, with a trailing backslash
  /// @param sFiles the pattern; an empty one is "*.*"
  /// @raises 5 if there is no file and sDelimiter is empty
  /// @raises 52 if the pattern is not valid
  /// @family files
  /// @see GetFileCount
  /// @example
  ///     u.SaveTextBox "one", folder & "\a.txt"
  ///     u.SaveTextBox "two", folder & "\b.txt"
  ///     Print u.GetFileList(",", folder & "\", "b*.txt")
  ///     ' b.txt
  virtual Text GetFileList(const Text& sDelimiter, const Text& sPath, const Text& sFiles);

  /// Reads the lines of a text file into an array, from index 0, and returns their number. A missing or empty file
  /// gives 0 and leaves the array as it was.
  /// @param sFilename the file
  /// @param sFList receives the lines.
  /// @param iEraseBlanks exactly 1 skips lines that are empty after VerifyTextData; the array may then have one element
  /// more than the result says
  /// @raises 9 for an array that does not start at 0
  /// @raises 70 if the file is locked
  /// @changes CounterVerifyText
  /// @family text files
  /// @see OpenFile, SaveBigFile
  /// @example
  ///     u.SaveBigFile Array("one", "", "three"), folder & "\list.txt"
  ///     list = Empty
  ///     Print u.OpenBigFile(folder & "\list.txt", list, 1)
  ///     ' 2
  ///     Print list(1)
  ///     ' three
  virtual std::int32_t OpenBigFile(const Text& sFilename, TextArray& sFList, const std::int16_t& iEraseBlanks);

  /// Reads the lines of a text file, up to a limit, into an array and returns their number. A missing or empty file
  /// gives 0 and leaves the array as it was.
  /// @param sFilename the file
  /// @param sFList receives the lines, from index 0.
  /// @param iRowLimit the most lines to read; 0 or less for all
  /// @raises 9 for an array that does not start at 0
  /// @raises 70 if the file is locked
  /// @family text files
  /// @see OpenBigFile, LoadTextBox
  /// @example
  ///     u.SaveBigFile Array("one", "two", "three"), folder & "\list.txt"
  ///     list = Empty
  ///     Print u.OpenFile(folder & "\list.txt", list, 2)
  ///     ' 2
  ///     Print list(1)
  ///     ' two
  virtual std::int32_t OpenFile(const Text& sFilename, TextArray& sFList, const std::int32_t& iRowLimit);

  /// Creates every folder of a path up to its last backslash. Failure is not reported, but a run-time error is shown in
  /// a message box.
  /// @param sPath the path; what follows its last backslash counts as a file's name
  /// @family files
  /// @see PathExists, SetupFileFolders
  /// @example
  ///     u.VerifyFilePath folder & "\reports\2009\any.txt"
  ///     Print u.PathExists(folder & "\reports\2009")
  ///     ' True
  virtual void VerifyFilePath(const Text& sPath);

  /// The part of a path up to its last backslash; without one, the current folder of its drive or of the process. The
  /// result always ends in a backslash. Never fails.
  /// @param vSpecIn the path; quotes around it are removed.
  /// @family files
  /// @see ExtractFilename
  /// @example
  ///     path = """C:\TAL\report.txt"""
  ///     Print "[" & u.ExtractPathName(path) & "]"
  ///     ' [C:\TAL\]
  ///     Print path
  ///     ' C:\TAL\report.txt
  virtual Text ExtractPathName(Text& vSpecIn);

  /// Writes a text and a line break to a file, which replaces it. After an error an existing file is as it was.
  /// @param sText the text
  /// @param sFilename the file
  /// @raises 76 if the folder is missing
  /// @raises 75 if the file is read-only
  /// @raises 70 if it is locked
  /// @raises 61 if the disk is full
  /// @family text files
  /// @see LoadTextBox, SaveBigFile
  /// @example
  ///     u.SaveTextBox "a line", folder & "\notes.txt"
  ///     Print u.LoadTextBox(folder & "\notes.txt") & "and no more"
  ///     ' a line
  ///     ' and no more
  virtual void SaveTextBox(const Text& sText, const Text& sFilename);

  /// The text of a file, up to a character 26, with its line ends as they are; empty for a missing file.
  /// @param sFilename the file
  /// @raises 70 if the file is locked
  /// @family text files
  /// @see SaveTextBox, OpenFile
  /// @example
  ///     u.SaveTextBox "a line", folder & "\notes.txt"
  ///     Print Len(u.LoadTextBox(folder & "\notes.txt"))
  ///     ' 8
  ///     Print Len(u.LoadTextBox(folder & "\missing.txt"))
  ///     ' 0
  virtual Text LoadTextBox(const Text& sFilename);

  /// Reads a setting from a profile file, or from the user's store. From a file: the value without one leading
  /// backslash or, if sItem is empty, the first name in the section; a value that then begins with two backslashes is
  /// returned empty. If there is none, the result is sDefaultData, which is also saved, to the user's store rather than
  /// to the file; with "NoDefaultData" the result is empty, and nothing is saved.
  ///
  /// From the store: if there is no value, the result is sDefaultData, which is also saved; in the group "CodeCount" it
  /// is an empty text, and nothing is saved.
  /// @param sSection the section
  /// @param sItem the item in it
  /// @param sDefaultData what to return if there is no value
  /// @param sFilename a profile file; for the store, a group: sNatNameD and anything unknown mean the user's,
  /// sORVDataName the database's, "PreviousDatabaseSettings" and "CodeCount" their own. Without a user, all but the
  /// previous settings are read from the database's.
  /// @param bLoadFromFile True reads from the file, False from the store
  /// @raises 57 if the store cannot be used
  /// @reads sDatabaseName, sUserName, sNatNameD, sORVDataName
  /// @family settings
  /// @see SaveCfgFileData
  /// @example From the store
  ///     value = "north"
  ///     u.sDatabaseName = "Main"
  ///     u.sUserName = "anne"
  ///     u.SaveCfgFileData "Branch", "Name", value, "any"
  ///     Print u.GetCfgFileData("Branch", "Name", "none", "any")
  ///     ' north
  /// @example From a profile file
  ///     value = "north"
  ///     u.SaveCfgFileData "Branch", "Name", value, folder & "\branch.ini", True
  ///     Print u.GetCfgFileData("Branch", "Name", "none", folder & "\branch.ini", True)
  ///     ' north
  ///     Print u.GetCfgFileData("Branch", "Phone", "none", folder & "\branch.ini", True)
  ///     ' none
  virtual Text GetCfgFileData(const Text& sSection, const Text& sItem, const Text& sDefaultData, const Text& sFilename,
                              const Boolean& bLoadFromFile);

  /// Writes a setting to a profile file, or to the user's store. A file that cannot be written is not reported.
  /// @param sSection the section
  /// @param sItem the item in it
  /// @param sOutput the value; in a file, one that is empty or begins with a backslash becomes a single backslash.
  ///
  /// @param sFilename a profile file; for the store, a group: "PreviousDatabaseSettings" and "CodeCount" are written
  /// alone, anything else to the user's group and the database's
  /// @param bSaveToFile True writes to the file, False to the store
  /// @raises 57 if the store cannot be used
  /// @reads sDatabaseName, sUserName, sNatNameD, sORVDataName
  /// @family settings
  /// @see GetCfgFileData
  /// @example
  ///     value = "\\server\share"
  ///     u.SaveCfgFileData "Branch", "Path", value, folder & "\branch.ini", True
  ///     Print "[" & value & "]"
  ///     ' [\]
  virtual void SaveCfgFileData(const Text& sSection, const Text& sItem, Text& sOutput, const Text& sFilename,
                               const Boolean& bSaveToFile);

  /// Packs files and folders into a zip archive, which may be encrypted or split into volumes. Errors are shown in a
  /// message box and not reported to the caller.
  /// @param sZipName the archive
  /// @param sItems the files, folders and patterns to pack, separated by blanks; names with blanks stand in double
  /// quotes
  /// @param iMultiVolume 1 creates a split set
  /// @param sEncryptionPassword the password; empty for none
  /// @param bUseFilePath not used
  /// @family archives
  /// @see CallUnZIPFiles, ZipControl
  /// @example
  ///     u.SaveTextBox "one", folder & "\a.txt"
  ///     u.CallZIPFiles folder & "\backup.zip", folder & "\a.txt", 0, "", False
  ///     Print u.FileExists(folder & "\backup.zip")
  ///     ' True
  virtual void CallZIPFiles(const Text& sZipName, const Text& sItems, const std::int16_t& iMultiVolume,
                            const Text& sEncryptionPassword, const Boolean& bUseFilePath);

  /// Unpacks a zip archive to a folder. Errors are shown in a message box. Encrypted entries are tried with the
  /// password of the last CallZIPFiles; if that fails, the user is asked.
  /// @param sUnZipName the archive, or the last volume of a split set
  /// @param sDestPath the folder; created if missing
  /// @param sItems the entries, folders and patterns to unpack; empty or "*.*" for all
  /// @param bOverWrite True replaces existing files; otherwise they stay
  /// @family archives
  /// @see CallZIPFiles, UnzipControl
  /// @example
  ///     u.SaveTextBox "one", folder & "\a.txt"
  ///     u.CallZIPFiles folder & "\backup.zip", folder & "\a.txt", 0, ""
  ///     u.CallUnZIPFiles folder & "\backup.zip", folder & "\restored\", "a.txt"
  ///     Print u.FileExists(folder & "\restored\*.*") & " " & u.PathExists(folder & "\restored")
  ///     ' True True
  virtual void CallUnZIPFiles(const Text& sUnZipName, const Text& sDestPath, const Text& sItems,
                              const Boolean& bOverWrite);

  /// The folder that the user chooses in the system's dialog; empty if it is cancelled.
  /// @param szTitle the text above the folders
  /// @family files
  /// @example windows
  ///     ' The user presses: Escape
  ///     Print "[" & u.BrowseForFolder("Where are the pictures?") & "]"
  ///     ' []
  virtual Text BrowseForFolder(const Text& szTitle);

  /// Draws a text in a rectangle of the host's picture box, DrawTextPictureBox, whose scale must be twips. An empty
  /// text draws nothing. A text wider than the rectangle is drawn from its top left corner and clipped, unless iJustify
  /// is -2; any other text is centred vertically. The box's FontBold and ForeColor are restored, even after an error.
  /// @param iDestX1 the left edge, in pixels
  /// @param iDestY1 the top edge
  /// @param iDestX2 the right edge
  /// @param iDestY2 the bottom edge
  /// @param sText the text
  /// @param lColor 0x00BBGGRR, or a system colour with the highest bit set
  /// @param iJustify -2 and -1 left, 1 right, 0 and anything else centred
  /// @param bBold True draws bold letters
  /// @param bWordWrap True breaks a text that is too wide between words
  /// @raises 91 if DrawTextPictureBox is not set
  /// @raises 13 if sText has no text form
  /// @raises 94 if sText is Null
  /// @reads DrawTextPictureBox
  /// @family drawing
  /// @see docs/drawing.md
  /// @example
  ///     Set u.DrawTextPictureBox = picSchedule
  ///     u.MyDrawText 0, 0, 100, 20, "Smith", 255, -1, True
  ///     Print picSchedule.Drawn & " at " & picSchedule.CurrentX
  ///     ' Smith at 0
  /// @example Without a box
  ///     On Error Resume Next
  ///     u.MyDrawText 0, 0, 100, 20, "Smith", 255, -1, True
  ///     Print Err.Number
  ///     ' 91
  virtual void MyDrawText(const std::int16_t& iDestX1, const std::int16_t& iDestY1, const std::int16_t& iDestX2,
                          const std::int16_t& iDestY2, const Variant& sText, const std::int32_t& lColor,
                          const std::int16_t& iJustify, const Boolean& bBold, const Boolean& bWordWrap);

  /// Sets a form's WindowState to the value that was saved and, in its normal state, its Width and Height, in twips. If
  /// nothing was saved, the state becomes 0 (normal) and the size stays.
  /// @param frm the form
  /// @param sCFGStr the section of the settings
  /// @raises 438 if the form has no such property; also the errors of the form and of GetCfgFileData
  /// @reads sNatNameC
  /// @family windows
  /// @see SaveWindowState
  /// @example
  ///     frmBooking.Width = 9000
  ///     u.SaveWindowState frmBooking, "Booking"
  ///     frmBooking.Width = 4000
  ///     u.LoadWindowState frmBooking, "Booking"
  ///     Print frmBooking.Width
  ///     ' 9000
  virtual void LoadWindowState(const Variant& frm, const Text& sCFGStr);

  /// Saves a form's WindowState and, only in its normal state, its Width and Height.
  /// @param frm the form
  /// @param sCFGStr the section of the settings
  /// @raises 438 if the form has no such property; also the errors of the form and of SaveCfgFileData
  /// @reads sNatNameC
  /// @family windows
  /// @see LoadWindowState
  /// @example
  ///     frmBooking.Width = 9000
  ///     u.SaveWindowState frmBooking, "Booking"
  ///     Print u.GetCfgFileData("Booking", "WindowWidth", "none", "")
  ///     ' 9000
  virtual void SaveWindowState(const Variant& frm, const Text& sCFGStr);

  /// Shows a grid as a report in the preview window, or writes the PDF file of an unattended month-end run. With
  /// AutomatedEndOfMonth exactly True no window opens: a caption of "BankSummaryReport", "SalesReport" or
  /// "BadDebtsReport" writes the file of that name in C:\TAL\ORV3\DATA\MONTHLYREPORTS; any other writes nothing.
  /// Otherwise the call returns when the user closes the window.
  /// @param iZoomLevel the zoom of the preview, in percent
  /// @param iPrintDirection 1 portrait, 2 landscape; anything else leaves what the last report had
  /// @param sReportName the report's name, which stands above every page
  /// @param sCsvName the folder in which the window's export begins
  /// @param ctlGrid the grid; a control of the host is printed as it looks
  /// @param vStDate the first date of the period in the header; Empty for none; with the text "DateTimeOnly", vEnDate
  /// is shown with its time instead
  /// @param vEnDate the last date
  /// @param fWindowCaption the title of the window; empty for the report's name
  /// @raises 13 if vStDate or vEnDate is not a date
  /// @raises 400 if the window is already open, or a report is being built
  /// @raises 438 if the grid has no hwnd; also the grid's errors
  /// @raises 445 where there is no screen
  /// @reads AutomatedEndOfMonth, sGridPaperSize, sGridPaperDuplex
  /// @family reports
  /// @see TextBoxPrintPreview, ListBoxPrintPreview, ExportGridData
  /// @example An unattended run
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.AddItem "North" & vbTab & "1250"
  ///     u.AutomatedEndOfMonth = True
  ///     u.GridPrintPreview 100, 1, "Bad debts", "", g, "01/03/2009", "31/03/2009", "BadDebtsReport"
  ///     Print u.FileExists("C:\TAL\ORV3\DATA\MONTHLYREPORTS\BadDebtsReport.pdf")
  ///     ' True
  /// @example windows In the preview window
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.AddItem "North" & vbTab & "1250"
  ///     ' The user presses: Escape
  ///     u.GridPrintPreview 100, 1, "Sales", "", g, Empty, Empty
  virtual void GridPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                const Text& sReportName, const Text& sCsvName, const Variant& ctlGrid,
                                const Variant& vStDate, const Variant& vEnDate, const Text& fWindowCaption);

  /// Shows the text of a text box as a report on A4 in the preview window, until the user closes it.
  /// @param iZoomLevel the zoom of the preview, in percent
  /// @param iPrintDirection 1 portrait, 2 landscape; anything else leaves what the last report had
  /// @param sReportName the report's name, which stands above every page
  /// @param sCsvName the folder in which the window's export begins
  /// @param ctlTextBox the text box; its Text is read
  /// @raises 400 if the window is already open, or a report is being built
  /// @raises 438 if the control has no Text; also the control's errors
  /// @raises 445 where there is no screen
  /// @family reports
  /// @see GridPrintPreview, ListBoxPrintPreview
  /// @example windows
  ///     txtNotes.Text = "Paint the fence."
  ///     ' The user presses: Escape
  ///     u.TextBoxPrintPreview 100, 1, "Notes", "", txtNotes
  virtual void TextBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlTextBox);

  /// Shows the entries of a list box as a report on A4 in the preview window, until the user closes it. Every entry has
  /// a line of its own.
  /// @param iZoomLevel the zoom of the preview, in percent
  /// @param iPrintDirection 1 portrait, 2 landscape; anything else leaves what the last report had
  /// @param sReportName the report's name, which stands above every page
  /// @param sCsvName the folder in which the window's export begins
  /// @param ctlListBox the list box; its ListCount and List are read
  /// @raises 400 if the window is already open, or a report is being built
  /// @raises 438 if the control is not a list box; also the control's errors
  /// @raises 445 where there is no screen
  /// @family reports
  /// @see GridPrintPreview, TextBoxPrintPreview
  /// @example windows
  ///     ' The user presses: Escape
  ///     u.ListBoxPrintPreview 100, 1, "Branches", "", lstBranches
  virtual void ListBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlListBox);

  /// The index of the first entry of a combo box with a given key; -1 if there is none. The box's Text is cleared in
  /// any case; its selection stays.
  /// @param cboCombo the combo box; its ListCount and ItemData are read
  /// @param vBranchUniqueID the key, compared with ItemData; one of 0 or less is never found
  /// @raises 438 if the control is not a combo box; also the control's errors
  /// @family combo boxes
  /// @see SearchCombo
  /// @example
  ///     Print u.GetComboListIndex(cboBranch, 20)
  ///     ' 1
  ///     Print u.GetComboListIndex(cboBranch, 99)
  ///     ' -1
  virtual std::int32_t GetComboListIndex(const Variant& cboCombo, const std::int32_t& vBranchUniqueID);

  /// Makes a list-combo control search for the text that was typed into it. The result is 0 if there is no text, -1 if
  /// it is not found, and otherwise the control's ListIndex afterwards.
  /// @param cboCombo the list-combo control
  /// @param msgFlag 1 reports a failed search in a message box; 2 selects the entry found, and otherwise the previous
  /// selection stays; anything else does neither
  /// @raises 6 if CounterVerifyText is at its maximum, or for a ListIndex beyond 16 bits
  /// @raises 438 if the control cannot search; also the control's errors
  /// @changes CounterVerifyText
  /// @family combo boxes
  /// @see SearchComboEx, GetComboListIndex
  /// @example
  ///     cboBranch.Text = ""
  ///     Print u.SearchCombo(cboBranch, 2)
  ///     ' 0
  ///     cboBranch.Text = "So"
  ///     Print u.SearchCombo(cboBranch, 2)
  ///     ' 1
  virtual std::int32_t SearchCombo(const Variant& cboCombo, const std::int16_t& msgFlag);

  /// Makes a list-combo control search for a given text. The result is -1 if it is not found, and otherwise the
  /// control's ListIndex afterwards.
  /// @param cboCombo the list-combo control
  /// @param sFind the text, which may be empty
  /// @param SearchMethod the control's search method
  /// @param msgFlag 1 reports a failed search in a message box; 2 selects the entry found; anything else selects the
  /// first entry
  /// @raises 438 if the control cannot search; also the control's errors
  /// @family combo boxes
  /// @see SearchCombo, GetComboListIndex
  /// @example
  ///     Print u.SearchComboEx(cboBranch, "South", 2, 2)
  ///     ' 1
  ///     Print u.SearchComboEx(cboBranch, "South", 2, 0)
  ///     ' 0
  virtual std::int32_t SearchComboEx(const Variant& cboCombo, const Text& sFind, const std::int32_t& SearchMethod,
                                     const std::int16_t& msgFlag);

  /// Sets the widths of a grid's columns to those that SaveGridWidths has saved, in twips. A column without a saved
  /// width becomes 1000, one whose saved text is no number 0.
  /// @param Grid1 the grid
  /// @param sCFGStr the section of the settings
  /// @param iStartColumn the first column, from 0
  /// @raises 438 if the control is not a grid; also the errors of the grid and of GetCfgFileData
  /// @reads sNatNameC
  /// @family grids
  /// @see SaveGridWidths
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.ColWidth(1) = 480
  ///     u.SaveGridWidths g, "Customers", 0
  ///     g.ColWidth(1) = 2000
  ///     u.LoadGridWidths g, "Customers", 0
  ///     Print g.ColWidth(1)
  ///     ' 480
  virtual void LoadGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn);

  /// Saves the widths of a grid's columns, in twips.
  /// @param Grid1 the grid
  /// @param sCFGStr the section of the settings
  /// @param iStartColumn the first column, from 0
  /// @raises 438 if the control is not a grid; also the errors of the grid and of SaveCfgFileData
  /// @reads sNatNameC
  /// @family grids
  /// @see LoadGridWidths
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.ColWidth(1) = 480
  ///     u.SaveGridWidths g, "Customers", 0
  ///     Print u.GetCfgFileData("Customers", "1ColWidth", "none", "")
  ///     ' 480
  virtual void SaveGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn);

  /// Writes the visible cells of a grid as comma-separated text to a file that the user chooses. The dialog starts in
  /// sReportsDir. A cancelled dialog, or any error, ends it silently; an existing file then stays as it was.
  /// @param m_Grid1 the grid
  /// @param iDontSaveHeader the first row that is written if bSelection is True; 0 also keeps the fixed cells
  /// @param bSelection True writes every row from there; anything else those from Row to RowSel
  /// @param sFilename names the folder below sReportsDir and, with ".txt", the file that the dialog suggests
  /// @reads sReportsDir
  /// @family grids
  /// @see Grid.SaveGrid, GridPrintPreview
  /// @example windows
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.AddItem "North" & vbTab & "1250"
  ///     u.sReportsDir = folder & "\"
  ///     ' The user presses: Return
  ///     u.ExportGridData g, 0, True, "Sales"
  ///     Print u.LoadTextBox(folder & "\Sales\Sales.txt") & "."
  ///     ' North,1250
  ///     ' .
  virtual void ExportGridData(const Variant& m_Grid1, const std::int16_t& iDontSaveHeader, const Boolean& bSelection,
                              const Text& sFilename);

  /// A date typed as eight digits DDMMYYYY, of the years 1900 to 2100, as text "DD/MM/YYYY"; an empty text for anything
  /// else.
  /// @param sText the digits
  /// @family calendar
  /// @see IsValueDate
  /// @example
  ///     Print u.GetDateFromString("31032009")
  ///     ' 31/03/2009
  ///     Print "[" & u.GetDateFromString("31022009") & "]"
  ///     ' []
  virtual Variant GetDateFromString(const Text& sText);

  /// True if every character is a digit or a capital letter from A to Z, and so for an empty text.
  /// @param sPassword the password
  /// @family passwords
  /// @see GenerateFilePassword
  /// @example
  ///     Print u.VerifyPasswordText("BRANCH12")
  ///     ' True
  ///     Print u.VerifyPasswordText("Branch 12")
  ///     ' False
  virtual Boolean VerifyPasswordText(const Text& sPassword);

  /// A stored duration as text "hours:minutes", in the shortest form: "1:30", "26:0". A stored duration is a date that
  /// is later than 1/1/1800 00:00 by the duration.
  /// @param vDate the stored duration. A bare time of day, the former way to store durations, becomes "1/1/1800 HH:MM";
  /// a text counts as one if it begins with "30/12/1899".
  /// @raises 6 beyond 32 bits of minutes
  /// @raises 13 if vDate is not a date
  /// @raises 94 if vDate is Null
  /// @family durations
  /// @see DurationToDateTime, ConvertDatabaseDurationToMinutes
  /// @example
  ///     stored = "2/1/1800 02:00"
  ///     Print u.DateTimeToDuration(stored)
  ///     ' 26:0
  /// @example A duration stored in the former way
  ///     stored = TimeSerial(1, 30, 0)
  ///     Print u.DateTimeToDuration(stored)
  ///     ' 1:30
  ///     Print stored
  ///     ' 1/1/1800 01:30
  virtual Variant DateTimeToDuration(Variant& vDate);

  /// Converts a duration to the form in which it is stored: 01/01/1800 01:30 for "1:30".
  /// @param vDuration a time of day, or "hours:minutes" ("1:30", "26:0")
  /// @raises 13 if it is neither
  /// @family durations
  /// @see DateTimeToDuration
  /// @example
  ///     stored = u.DurationToDateTime("26:0")
  ///     Print u.DateTimeToDuration(stored)
  ///     ' 26:0
  virtual Variant DurationToDateTime(const Variant& vDuration);

  /// A time of day as decimal hours; minutes other than 15, 30 and 45 are ignored, and 0 hours become 1.5.
  /// @param vT the time; "-" is read as "0", and anything else that is not a time gives 0
  /// @family durations
  /// @see ConvertDatabaseDurationToNumber
  /// @example
  ///     Print u.ConvertDurationToNumber("01:45")
  ///     ' 1.75
  ///     Print u.ConvertDurationToNumber("00:00")
  ///     ' 1.5
  virtual float ConvertDurationToNumber(const Variant& vT);

  /// Converts decimal hours in a text ("1.5", ".25") to a stored duration. The fractions 5, 25 and 75 are quarters of
  /// an hour; any other is taken as minutes: "1.50" is 1 hour 50.
  /// @param sDuration the hours; becomes the text without blanks at its ends.
  /// @raises 13 if the result is not "hours:minutes"
  /// @family durations
  /// @see DurationToDateTime, ConvertDatabaseDurationToNumber
  /// @example
  ///     hours = " 1.5 "
  ///     stored = u.DurToTime(hours)
  ///     Print u.ConvertDatabaseDurationToMinutes(stored)
  ///     ' 90
  ///     Print "[" & hours & "]"
  ///     ' [1.5]
  virtual Variant DurToTime(Text& sDuration);

  /// A stored duration as decimal hours, in a text ("0.25"). Minutes other than 15, 30 and 45 are ignored, 0 becomes
  /// "1.5", and more than 24 hours become "1".
  /// @param vDuration the stored duration; a bare time of day becomes "1/1/1800 HH:MM".
  /// @raises 6 beyond 32 bits of minutes
  /// @raises 13 if vDuration is not a date
  /// @family durations
  /// @see ConvertDatabaseDurationToMinutes, DurToTime
  /// @example
  ///     stored = "1/1/1800 01:45"
  ///     Print u.ConvertDatabaseDurationToNumber(stored)
  ///     ' 1.75
  virtual Text ConvertDatabaseDurationToNumber(Variant& vDuration);

  /// Converts minutes to a stored duration. An error is shown in a message box, and the result is then the text
  /// "1/1/1800 00:00".
  /// @param iMinutes the minutes
  /// @family durations
  /// @see ConvertDatabaseDurationToMinutes
  /// @example
  ///     stored = u.ConvertNumberToDatabaseDuration(90)
  ///     Print u.DateTimeToDuration(stored)
  ///     ' 1:30
  virtual Variant ConvertNumberToDatabaseDuration(const std::int16_t& iMinutes);

  /// A stored duration in minutes.
  /// @param vDuration the stored duration; a bare time of day becomes "1/1/1800 HH:MM".
  /// @raises 6 beyond 32 bits of minutes
  /// @raises 13 if vDuration is not a date
  /// @family durations
  /// @see ConvertNumberToDatabaseDuration, ConvertDatabaseDurationToNumber
  /// @example
  ///     stored = "2/1/1800 02:00"
  ///     Print u.ConvertDatabaseDurationToMinutes(stored)
  ///     ' 1560
  virtual std::int32_t ConvertDatabaseDurationToMinutes(Variant& vDuration);

  /// Shows the machine's drives, memory, processor and operating system, and a folder or file, until the user closes
  /// it.
  /// @raises 445 where there is no screen
  /// @family information windows
  /// @see docs/windows.md
  /// @example windows
  ///     ' The user presses: Escape
  ///     u.ShowSysInfo
  virtual void ShowSysInfo();

  /// Deletes the files that match a path. Read-only files stay. Failures are not reported.
  /// @param sFileSpec the path; wildcards are allowed in its last part
  /// @family files
  /// @see FileExists
  /// @example
  ///     u.SaveTextBox "one", folder & "\a.tmp"
  ///     u.DeleteFiles folder & "\*.tmp"
  ///     Print u.FileExists(folder & "\a.tmp")
  ///     ' False
  virtual void DeleteFiles(const Text& sFileSpec);

  /// True, whatever the address is: the test is disabled.
  /// @param sAddress not used
  /// @family network
  /// @example
  ///     Print u.PingSite("example.com")
  ///     ' True
  virtual Boolean PingSite(const Text& sAddress);

  /// Adds a line to the event log, EventLog.txt in the folder sORVPath, unless EventLog is 0. The line is
  /// "user:DDMMYYYYHHMMSS:event:form".
  /// @param sEventName the event
  /// @param sEventForm the form where it happened
  /// @raises 76 if the folder is missing
  /// @raises 75 if the log is read-only
  /// @raises 61 if the disk is full
  /// @reads EventLog, sORVPath, sUserName
  /// @family event log
  /// @example
  ///     u.EventLog = 1
  ///     u.sORVPath = folder
  ///     u.sUserName = "anne"
  ///     u.AppendEventLog "Saved", "frmBooking"
  ///     Print Len(u.LoadTextBox(folder & "\EventLog.txt"))
  ///     ' 38
  virtual void AppendEventLog(const Text& sEventName, const Text& sEventForm);

  /// Ticks or clears all rows in a column of check boxes of a grid, including hidden rows. An error is shown in a
  /// message box and ends it.
  /// @param lColumn the column, from 0; its ColDataType must be 11
  /// @param vGrid the grid
  /// @param iSwitch 1 ticks, 0 clears
  /// @family grids
  /// @see CountGridSelectedRows, Grid.ColDataType
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.ColDataType(1) = 11
  ///     g.AddItem "1001" & vbTab & "False"
  ///     g.AddItem "1002" & vbTab & "False"
  ///     u.SelectGridRows 1, g, 1
  ///     Print u.CountGridSelectedRows(1, g)
  ///     ' 2
  virtual void SelectGridRows(const std::int32_t& lColumn, const Variant& vGrid, const std::int16_t& iSwitch);

  /// The number of ticked rows in a column of check boxes of a grid, including hidden rows; 0 for another column. An
  /// error is shown in a message box; the result is then what was counted before it.
  /// @param lColumn the column, from 0; its ColDataType must be 11
  /// @param vGrid the grid
  /// @family grids
  /// @see SelectGridRows, Grid.Cell
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.ColDataType(1) = 11
  ///     g.AddItem "1001" & vbTab & "True"
  ///     g.AddItem "1002" & vbTab & "False"
  ///     Print u.CountGridSelectedRows(1, g)
  ///     ' 1
  virtual std::int32_t CountGridSelectedRows(const std::int32_t& lColumn, const Variant& vGrid);

  /// The text as printable cipher text, different each time; empty for an empty text. Any instance of the library can
  /// decrypt it: it keeps texts from being read at a glance, not from those who have the library.
  /// @param sSourceString the text
  /// @family passwords
  /// @see CryptoDecryptString, docs/cipher-text.md
  /// @example
  ///     secret = u.CryptoEncryptString("branch 12")
  ///     Print u.CryptoDecryptString(secret)
  ///     ' branch 12
  virtual Text CryptoEncryptString(const Text& sSourceString);

  /// The text that was passed to CryptoEncryptString; empty for an empty text.
  /// @param sSourceString the cipher text
  /// @raises 5 with a description of its own, for anything but a complete cipher text
  /// @family passwords
  /// @see CryptoEncryptString, docs/cipher-text.md
  /// @example
  ///     On Error Resume Next
  ///     text = u.CryptoDecryptString("QUJD")
  ///     Print Err.Number & " " & Err.Description
  ///     ' 5 This is not a cipher text of this library, or it was changed
  virtual Text CryptoDecryptString(const Text& sSourceString);

  /// The status of reading a registry value below the current user's hive. 0 is success, 2 a missing value, 6 a key
  /// that cannot be opened, -1 a type other than 1 (text) and 4 (number).
  /// @param sKeyName the key
  /// @param sValueName the value
  /// @family registry
  /// @see REGISTRY_ReturnValue
  /// @example
  ///     u.REGISTRY_CreateNewKey "Software\Examples", -2147483647
  ///     u.REGISTRY_SetKeyValue "Software\Examples", "Branch", 12, 4
  ///     Print u.REGISTRY_QueryValue("Software\Examples", "Branch")
  ///     ' 0
  ///     Print u.REGISTRY_QueryValue("Software\Examples", "Missing")
  ///     ' 2
  virtual std::int32_t REGISTRY_QueryValue(const Text& sKeyName, const Text& sValueName);

  /// A registry value below the current user's hive, as text; empty if it cannot be read. Failures are not reported.
  /// @param sKeyName the key
  /// @param sValueName the value
  /// @family registry
  /// @see REGISTRY_QueryValue, REGISTRY_SetKeyValue
  /// @example
  ///     u.REGISTRY_CreateNewKey "Software\Examples", -2147483647
  ///     u.REGISTRY_SetKeyValue "Software\Examples", "Branch", 12, 4
  ///     Print u.REGISTRY_ReturnValue("Software\Examples", "Branch")
  ///     ' 12
  virtual Text REGISTRY_ReturnValue(const Text& sKeyName, const Text& sValueName);

  /// Writes a value of an existing registry key below the current user's hive. Failures of the registry are not
  /// reported.
  /// @param sKeyName the key
  /// @param sValueName the value
  /// @param vValueSetting what to write
  /// @param lValueType 1 for a text, 4 for a number; other types write nothing
  /// @raises 6 for a number beyond 32 bits
  /// @raises 13 if the value cannot be converted
  /// @raises 94 if it is Null
  /// @family registry
  /// @see REGISTRY_ReturnValue, REGISTRY_CreateNewKey
  /// @example
  ///     u.REGISTRY_CreateNewKey "Software\Examples", -2147483647
  ///     u.REGISTRY_SetKeyValue "Software\Examples", "Name", "north", 1
  ///     Print u.REGISTRY_ReturnValue("Software\Examples", "Name")
  ///     ' north
  virtual void REGISTRY_SetKeyValue(const Text& sKeyName, const Text& sValueName, const Variant& vValueSetting,
                                    const std::int32_t& lValueType);

  /// Creates a registry key below a predefined root, with the keys above it. An existing key stays as it is.
  /// @param sNewKeyName the key
  /// @param lPredefinedKey the root; -2147483647 (0x80000001) is the current user's
  /// @family registry
  /// @see REGISTRY_SetKeyValue
  /// @example
  ///     u.REGISTRY_CreateNewKey "Software\Examples\New", -2147483647
  ///     Print u.REGISTRY_QueryValue("Software\Examples\New", "Any")
  ///     ' 2
  virtual void REGISTRY_CreateNewKey(const Text& sNewKeyName, const std::int32_t& lPredefinedKey);

  /// The characters of a text in reverse order.
  /// @param sSource the text
  /// @raises 6 for a text beyond 32767 characters
  /// @family strings
  /// @example
  ///     Print u.ReverseString("abc")
  ///     ' cba
  virtual Text ReverseString(const Text& sSource);

  /// The position of the blank before the text part of an address line that starts with numbers; 0 if there is none.
  /// @param sSource the address line
  /// @param iOption 1; anything else gives 0
  /// @raises 6 for a position beyond 32767
  /// @family strings
  /// @see NumbersInString
  /// @example
  ///     Print u.StringPosition("12 SMITH ST", 1)
  ///     ' 3
  virtual std::int16_t StringPosition(const Text& sSource, const std::int16_t& iOption);

  /// True if a text has at least one digit.
  /// @param sSource the text
  /// @family checks
  /// @see RemoveNumberFromString
  /// @example
  ///     Print u.NumbersInString("Unit 12")
  ///     ' True
  ///     Print u.NumbersInString("Unit")
  ///     ' False
  virtual Boolean NumbersInString(const Text& sSource);

  /// Asks for a text in a box that stays above all other windows. The text is returned in clear, even if asterisks are
  /// shown; it is empty if the box is closed by its menu. A long prompt makes the box higher. On Linux the question is
  /// asked at the terminal.
  ///
  /// With bNoFrame and bNonCloseable both True it is a notice: the call returns at once, with the result of the box's
  /// last use, and the notice stays until the host closes its window.
  /// @param sCaption the title
  /// @param sPrompt the question
  /// @param bPassword True shows asterisks for what is typed
  /// @param bShowUserInput False shows no entry; OK then returns an empty text
  /// @param bNoFrame True shows the box without a frame, and so from then on
  /// @param bNonCloseable True leaves the box without a way to close it but its buttons
  /// @param lBackColor the colour behind the texts: 0x00BBGGRR, or a system colour
  /// @raises 400 if the box is already on the screen
  /// @raises 445 where there is no screen
  /// @family input box
  /// @see CheckDeleteRecord, docs/windows.md
  /// @example windows
  ///     ' The user types: anne
  ///     Print u.MyInputBox("Name", "Who are you?")
  ///     ' anne
  virtual Text MyInputBox(const Text& sCaption, const Text& sPrompt, const Boolean& bPassword,
                          const Boolean& bShowUserInput, const Boolean& bNoFrame, const Boolean& bNonCloseable,
                          const std::int32_t& lBackColor);

  /// The number of minutes from midnight to a time of day.
  /// @param vTime a time, a date with a time, or the text of one
  /// @raises 13 if vTime is not a date or time
  /// @family durations
  /// @see GetTimeDifference
  /// @example
  ///     Print u.ConvertTimeToMinutes("01:30")
  ///     ' 90
  virtual std::int32_t ConvertTimeToMinutes(const Variant& vTime);

  /// True if a text is one of the fields of a list that each end with a delimiter. The text behind the last delimiter
  /// is not compared.
  /// @param sSourceString the text to look for
  /// @param sDestString the list
  /// @param sDelimiter the delimiter, one character
  /// @raises 6 for a list beyond 32767 characters
  /// @family strings
  /// @see IndexInList, GetData
  /// @example
  ///     Print u.MyInstrDelim("green", "red,green,blue", ",")
  ///     ' True
  ///     Print u.MyInstrDelim("blue", "red,green,blue", ",")
  ///     ' False
  virtual Boolean MyInstrDelim(const Text& sSourceString, const Text& sDestString, const Text& sDelimiter);

  /// Prints a form as it appears, through printhelper.dll, which must be beside TALUtil.dll or the program.
  /// @param vForm the form; its hwnd and Refresh are used
  /// @raises 53 if printhelper.dll is missing
  /// @raises 438 if the form has no hwnd; also the form's errors
  /// @raises 453 if printhelper.dll lacks a function
  /// @family reports
  /// @example
  ///     On Error Resume Next
  ///     u.PrintScreen frmBooking
  ///     Print Err.Number
  ///     ' 53
  virtual void PrintScreen(const Variant& vForm);

  /// True if a folder exists. Never fails.
  /// @param sDirectory the folder; quotes around it are ignored
  /// @family files
  /// @see FileExists, VerifyFilePath
  /// @example
  ///     Print u.PathExists(folder)
  ///     ' True
  ///     Print u.PathExists(folder & "\missing")
  ///     ' False
  virtual Boolean PathExists(Text sDirectory);

  /// Creates the application's folders. A configured folder that cannot be created is replaced, in its setting too, by
  /// the one below C:\TAL\ORV3. A run-time error stops it; it is shown if bIsProgrammer is exactly True.
  /// @reads bIsProgrammer, sPicturesDir, sDrawingsDir, sReportsDir, sTemplatesDir, sHelpDir
  /// @changes sPicturesDir, sDrawingsDir, sReportsDir, sTemplatesDir, sHelpDir
  /// @family files
  /// @see VerifyFilePath
  /// @example
  ///     u.sPicturesDir = folder & "\Pictures\"
  ///     u.SetupFileFolders
  ///     Print u.PathExists(folder & "\Pictures")
  ///     ' True
  virtual void SetupFileFolders();

  /// A new GUID as 38 characters: hexadecimal digits, letters in upper case, in braces.
  /// @family text
  /// @example
  ///     Print Len(u.GetNewGuid())
  ///     ' 38
  virtual Text GetNewGuid();

  /// Writes the year to second of a date to a system time record; its day of the week and milliseconds stay. Scripts
  /// have no such records: this member is for early-bound programs.
  /// @param the_date the date
  /// @param system_time receives the date.
  /// @raises 6 for a date out of range
  /// @raises 13 for anything but a record
  /// @family system time
  /// @see SystemTimeToDate
  /// @example A script has no record to pass
  ///     On Error Resume Next
  ///     record = Empty
  ///     u.DateToSystemTime DateSerial(2009, 3, 31), record
  ///     Print Err.Number
  ///     ' 13
  virtual void DateToSystemTime(Date the_date, SystemTime& system_time);

  /// Reads a date from a system time record. Parts may be out of range: month 13 is the following January, day 0 the
  /// last day of the previous month. Years 0 to 99 are 1930 to 2029. Scripts have no such records: this member is for
  /// early-bound programs.
  /// @param system_time the record
  /// @param the_date receives the date.
  /// @raises 5 if the result is not a date
  /// @raises 13 for anything but a record
  /// @family system time
  /// @see DateToSystemTime
  /// @example A script has no record to pass
  ///     On Error Resume Next
  ///     d = Empty
  ///     u.SystemTimeToDate Empty, d
  ///     Print Err.Number
  ///     ' 13
  virtual void SystemTimeToDate(const SystemTime& system_time, Date& the_date);

  /// Converts a local time to UTC, to the second, by today's offset whatever the date is. Summer and winter time are
  /// not distinguished. Times before 1601 cannot be converted.
  /// @param the_date the local time
  /// @family system time
  /// @see UTCToLocalTime
  /// @example
  ///     noon = DateSerial(2009, 3, 31) + TimeSerial(12, 0, 0)
  ///     Print u.ConvertTimeToMinutes(u.UTCToLocalTime(u.LocalTimeToUTC(noon)))
  ///     ' 720
  virtual Date LocalTimeToUTC(Date the_date);

  /// Converts a UTC time to local time, to the second, by today's offset whatever the date is. Summer and winter time
  /// are not distinguished. Times before 1601 cannot be converted.
  /// @param the_date the UTC time
  /// @family system time
  /// @see LocalTimeToUTC
  /// @example
  ///     noon = DateSerial(2009, 3, 31) + TimeSerial(12, 0, 0)
  ///     Print u.ConvertTimeToMinutes(u.LocalTimeToUTC(u.UTCToLocalTime(noon)))
  ///     ' 720
  virtual Date UTCToLocalTime(Date the_date);

  /// Replaces every occurrence of a text by another; despite the name, word boundaries do not matter.
  /// @param sSource the text to search
  /// @param sChangeFrom what is replaced; an empty text changes nothing
  /// @param sChangeTo what takes its place; may be empty
  /// @family strings
  /// @see StringReplace
  /// @example
  ///     Print u.StringReplaceWord("12 Smith Street, Streetsville", "Street", "St")
  ///     ' 12 Smith St, Stsville
  virtual Text StringReplaceWord(const Text& sSource, const Text& sChangeFrom, const Text& sChangeTo);

  /// An array, from index 0, of the machine's IPv4 addresses in ascending order. It has no elements if there are no
  /// addresses, or more than 21.
  /// @family network
  /// @example
  ///     addresses = u.GetIpAddrTable()
  ///     Print UBound(addresses) + 1 > 0
  ///     ' True
  virtual Variant GetIpAddrTable();

  /// Cleans a memo of several lines for a field of the database. Every line feed becomes a blank; then runs of 2, 3 and
  /// 4 blanks, line breaks and carriage returns are shortened, each in a single pass. A line break ends up as a
  /// carriage return and a blank.
  /// @param sMemData the memo
  /// @family text
  /// @see VerifyTextData
  /// @example
  ///     Print Len(u.VerifyMemField("one" & vbCrLf & "two"))
  ///     ' 8
  virtual Text VerifyMemField(const Text& sMemData);

 private:
  Library& library_;
};

}  // namespace talutil
