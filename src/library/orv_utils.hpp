#pragma once

#include <cstdint>

#include "automation/system_time.hpp"
#include "automation/variant.hpp"
#include "library/shared_settings.hpp"

namespace talutil {

class Library;

/// The toolkit object that hosts create. Objects have no state of their own: settings live in the library.
///
/// Members stand in the order of their slots. The signature states the interface: `T` is passed by value,
/// `const T&` by reference and never changed, `T&` by reference and written back. Members call one another
/// through the object, so an override of one is seen by the others. Any run-time error leaves a member as
/// RunTimeError; what it had written back by then stays written.
class ORVUtils {
 public:
  explicit ORVUtils(Library& library) noexcept : library_(library) {}
  ORVUtils(const ORVUtils&) = delete;
  ORVUtils& operator=(const ORVUtils&) = delete;
  virtual ~ORVUtils() = default;

  [[nodiscard]] Library& library() const noexcept { return library_; }
  [[nodiscard]] SharedSettings& settings() const noexcept;
  [[nodiscard]] Locale locale() const;

  /// Ends the library's use by the host: unloads the components window (loading it first if it is not
  /// loaded). Shows "Closing ORVUtils Components form" before that when DebugMode is exactly 1.
  virtual void Terminate();

  /// Cleans a value for a text field of the database: trims blanks, ends at the first NUL, spells "&" as
  /// "and", turns the apostrophe into an acute accent, removes the double quote, tab, "#", ">", "<" and "?".
  /// @param iMaxTextLength the field's width in characters; 0 or less for no limit
  /// @param iExtras 1 removes commas, 2 blanks, 3 both, 4 compresses to three lines, 5 drops lines with $*$
  /// @param vData the value; Null and Empty give an empty text
  /// Adds 1 to CounterVerifyText first; raises 6 when that is at its maximum, and 13 for what has no text.
  virtual Text VerifyTextData(const std::int16_t& iMaxTextLength, const std::int16_t& iExtras, const Variant& vData);

  /// The text before the first NUL character; the whole text when there is none.
  virtual Text StripNulls(const Text& s);

  /// The characters whose ANSI code is 65 or more: letters stay, digits, blanks and punctuation below "A" go.
  virtual Text RemoveNumberFromString(const Text& sTemp);

  /// Filters characters: iOption 0 keeps digits, 1 digits and blanks, 2 all that differ from sCharacter,
  /// 3 digits and full stops; any other value gives an empty text. With option 2 an empty sCharacter becomes
  /// a blank, which is written back; one of several characters removes nothing.
  virtual Text RemoveStringsFromNumber(const std::int16_t& iOption, const Text& sTemp, Text& sCharacter);

  /// Replaces each character whose ANSI code is that of the first character of sChr by the whole of sReplace.
  /// Raises 5 for an empty sChr, unless sSrc is empty.
  virtual Text StringReplace(const Text& sSrc, const Text& sChr, const Text& sReplace);

  /// The date with another day of the month, as text "DD/MM/YYYY". A day that the month lacks leaves the text as it
  /// is put together: "31/2/2009". Raises 13 for what is no date, 94 for Null.
  virtual Variant SetDayOfMonth(const Variant& vDate, const std::int16_t& iDayNumber);

  /// The financial year (1 July to 30 June) of a date, two digits a year: 15/08/2009 gives "0910". The century does
  /// not wrap: 01/07/1999 gives "99100" and 01/03/2000 "-100". Raises 13 for what is no date.
  virtual Text GetFinancialYearStr(const Variant& vDate);

  /// True when vFromDate is on or before the date that WeekYearToDate gives for the week with iDay 0, or vToDate on
  /// or after it; so False only for a range that runs backwards around it. An iWeek outside 1 to 52 is written back
  /// as the nearest of these. Raises 13 for what is no date, 94 for Null.
  virtual Boolean GetWeekInDateRange(const Variant& vFromDate, const Variant& vToDate, std::int16_t& iWeek,
                                     const std::int16_t& iYear);

  /// The text between the iSt-th and the iEn-th comma; with iSt 0, the text before the iEn-th. A missing comma
  /// or a negative iSt gives an empty text, so the text after the last comma is never obtained: stored lists
  /// end with a comma. Raises 5 when the iEn-th comma does not come after the iSt-th.
  virtual Text GetData(const Text& sSrcStr, const std::int32_t& iSt, const std::int32_t& iEn);

  /// A time of day as text "HH:MM"; "01:30" for what is no date or time, in every mode of iFlag. Adds 1 to
  /// CounterVerifyTime first; raises 6 when that is at its maximum, and nothing else.
  virtual Variant VerifyNullTime(const std::int16_t& iFlag, const Variant& vTime);

  /// A date as the screens show it, a text; the date 01/01/1980, not a text, for what is no date, for that day's
  /// midnight and for all before. During that day the text is empty but in modes 1 to 3.
  /// @param iFlag 1 shows 01/01/1980 during that day, 2 shows "DD/MM/YYYY HH:MM", 3 shows the current date and time
  /// during that day, 4 shows "DDMMYYYY", any other "DD/MM/YYYY"
  /// @param vDate the text "00:00:00" is written back as "01/01/1980"
  /// Adds 1 to CounterVerifyDate first; raises 6 when that is at its maximum, and nothing else.
  virtual Variant VerifyNullDate(const std::int16_t& iFlag, Variant& vDate);

  /// The week of a date: days 1 to 7 of the year are week 1, and all after week 51 is week 52. Null and empty give
  /// 1. Raises 13 for what is no date.
  virtual std::int16_t GetWeekNumber(const Variant& vDate);

  /// A date of a week, the weeks laid out by the calendar of the current year (common or leap), whatever iYear is.
  /// @param iWeek 1 to 52; the nearest of these is written back for others
  /// @param iDay 1 gives the first day and 2 the last (of week 52, 31 December), as dates; 0 gives the first day of the
  /// week after, as text "DD/MM/YYYY", by the calendar of iYear; any other gives Empty
  /// Raises 13 for a year that is none.
  virtual Variant WeekYearToDate(std::int16_t& iWeek, const std::int16_t& iYear, const std::int16_t& iDay);

  /// The parts of a date; 2000, 1 and 1 for Null and for an empty text. Raise 13 for what is no date.
  virtual std::int16_t GetYear(const Variant& vDate);
  virtual std::int16_t GetMonth(const Variant& vDate);
  virtual std::int16_t GetDay(const Variant& vDate);

  /// True for an empty address, and for one with an "@" and a "." anywhere, in any order.
  virtual Boolean VerifyEmail(const Text& sTemp);

  /// True when a point lies strictly within a rectangle: one on an edge does not. False when an argument is Null; texts
  /// compare as texts, and a number is less than any text. Raises 13 for what cannot be compared.
  virtual Boolean GetMousePos(const Variant& lngSrcX, const Variant& lngSrcY, const Variant& lngDestX1,
                              const Variant& lngDestY1, const Variant& lngDestX2, const Variant& lngDestY2);

  /// The pages that rows need, counted in single precision: above 2^24 pages the count is no longer exact. Raises 11
  /// for iRowsPerPage 0.
  virtual std::int32_t GetMaxPages(const std::int32_t& iRowsPerPage, const std::int32_t& iRowCount);

  /// The index of the first element that begins with sText, without regard to case; -1 when there is none. An
  /// empty sText matches element 0. The scan starts at index 0 whatever the lower bound is: raises 9 for a
  /// lower bound above 0 and for an unallocated array.
  virtual std::int32_t IndexInList(const TextArray& sFList, const Text& sText);

  /// The position (from 1) of the iCount-th character of s2 that equals the one-character s1; 0 when there
  /// are fewer. The count is tested after every character, matched or not, so an iCount of 0 gives 1,
  /// unless the first character matches.
  virtual std::int32_t MyPos(const Text& s1, const Text& s2, const std::int32_t& iCount);

  /// How often the one-character sSubStr stands in sSrcStr; 0 for a sSubStr of any other length.
  virtual std::int32_t SubStrCount(const Text& sSubStr, const Text& sSrcStr);

  /// The days of a month, 28 to 31; 28 when month or year is 0. Raises 9 for a month outside 1 to 12.
  virtual std::int16_t GetDaysThisMonth(const std::int16_t& iMonth, const std::int16_t& iYear);

  /// Splits sTemp at each one-character sDelimiter into sFList, with indexes from 0, and gives the number of
  /// elements. The text after the last delimiter is dropped. Without a delimiter, and for an empty sTemp, the
  /// result is 0 and sFList keeps what it held. Raises 9 for an array that does not start at 0 or below.
  virtual std::int32_t ReadCommaDelimStrToList(const Text& sTemp, TextArray& sFList, const Text& sDelimiter);

  /// The leading number of a value as text ("12abc" gives "12"); "0" when there is none. Null gives an empty
  /// text, or "0" with iFlag 1. Adds 1 to CounterVerifyInt first; raises 6 when that is at its maximum and
  /// for a number beyond the range of a double.
  virtual Text VerifyIntData(const std::int16_t& iFlag, const Variant& vData);

  /// True for a text of digits and full stops only: "1.2.3" and "." pass; a sign, a blank or a comma fails, and so does
  /// an empty text.
  virtual Boolean IsValueNumber(const Text& sText);

  /// True for the shape day/month/year in digits, with "/" or "-" between; ranges are not looked at: 99/99/9999 passes.
  /// Two digits of the day with one of the month fail (12/3/2024), as hosts have always seen.
  virtual Boolean IsValueDate(const Text& sText);

  /// True for hours of one or two digits, ":" and minutes; seconds fail, ranges are not looked at.
  virtual Boolean IsValueTime(const Text& sText);

  /// Replaces each carriage return and then each line feed by sReplace: a line break becomes two copies.
  virtual Text CRLFStringReplace(const Text& sSrc, const Text& sReplace);

  /// Undoes CRLFStringReplace for a one-character marker: each marker and the character after it become a line
  /// break. A marker at the very end gives a line break and stays. Raises 6 beyond 32767 characters.
  virtual Text StringRestoreCRLF(const Text& sSrc, const Text& sSourceCharacter);

  /// Pads with "0" up to iExpLength characters: before the text with iJustify -1, after it with 1, else not.
  virtual Text AddZeros(const Text& sText, const std::int16_t& iExpLength, const std::int16_t& iJustify);

  /// The hours and minutes from one date and time to another, as text "1:30", both negative for a time before:
  /// "-1:-30". Days count only where the text of the end date comes after that of the start date: 31/01/2024 to
  /// 01/02/2024 counts none. The dates are written back as "DD/MM/YYYY" and the times as "HH:MM", in the order of the
  /// arguments as far as they can be read. Raises 13 for what is no date or time, 6 beyond 32 bits of minutes.
  virtual Variant GetTimeDifference(Variant& vStDate, Variant& vEnDate, Variant& vStTime, Variant& vEnTime);

  /// The date so many years later, as text "DD/MM/YYYY"; 29 February becomes the 28th in common years. A year below
  /// 100 comes out as the one it is short for, and one beyond 9999 as text that no longer is a date. Raises 13 for
  /// what is no date, 6 for a year beyond 16 bits.
  virtual Variant IncYear(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The days between two dates, times of day left out, whichever is the earlier; -1 when either is empty. Raises 13
  /// for what is no date, Null included, and 6 when one of two different dates is 31/12/9999.
  virtual std::int32_t GetDaysInPeriod(const Variant& vStartDate, const Variant& vEndDate);

  /// The month boundaries between two dates, whichever is the earlier; -1 for equal dates and when either is empty.
  /// Raises what GetDaysInPeriod raises.
  virtual std::int32_t GetMonthsInPeriod(const Variant& vStartDate, const Variant& vEndDate);

  /// The date so many days later, as text "DD/MM/YYYY"; years as in IncYear. Raises 13 for what is no date, 6 for
  /// -32768 days.
  virtual Variant IncDay(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The day of a date with the time of day sTime, as text "DD/MM/YYYY HH:MM"; a time that the date had is replaced.
  /// Raises 13 for what is no date or time.
  virtual Variant AddTimeToDate(const Variant& vSrcDate, const Text& sTime);

  /// IncDay by seven times iNum, which raises 6 beyond -4681 to 4681.
  virtual Variant IncWeek(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The date so many months later, as text "DD/MM/YYYY", on the same day of the month or its last: 31 March less a
  /// month is 28 February. Raises 13 for what is no date, 6 for -32768 months.
  virtual Variant IncMonth(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The date one step of a repeat later, as text "DD/MM/YYYY".
  /// @param vStep "Years" or "Yearly", "Months" or "Monthly", "Weeks" or "Weekly", "Days" or "Daily", case included;
  /// any other word gives "30/12/1899"
  /// @param vIncrement the number of years, months and so on, as a 16-bit integer
  /// Raises what the Inc member of the word raises, and 6, 13 or 94 for an increment that is no such number.
  virtual Variant GetNextDate(const Variant& vStartDate, const Variant& vStep, const Variant& vIncrement);

  /// Shows what a value returned by the start of a program means: 0, 2, 3, 5, 6, 8, 10 to 16 and 19 to 21 have a
  /// message, every other value shows nothing. Source of the texts: the platform's documentation of the function, as
  /// hosts' users know them.
  virtual void DrawShellExecuteError(const std::int32_t& lRetVal);

  /// Asks the user to type YES in upper case; True when they do. Anything else, a cancelled box too, shows a warning,
  /// from which they go back to the box or give up (False). Where there is nobody to ask the answer is False.
  virtual Boolean CheckDeleteRecord();

  /// The same about a change of the database, the caption standing in the title of the box.
  virtual Boolean CheckModifyDatabase(const Text& sCaption);

  /// A name in the case style of iCharactercase: 1 name case, 2 lower, 3 upper, anything else as it is; with iFlag 1
  /// always name case, unless the style is 0 or less. What is converted is the value as VerifyTextData cleans it (which
  /// counts in CounterVerifyText); values that name machinery, are empty or Null, or are not to be converted come back
  /// unchanged. Raises 13 for what has no text, and what the name-case converter raises.
  virtual Variant ConvertCase(const std::int16_t& iFlag, const Variant& vStr);

  /// The same for suburbs by iCharacterCaseSuburbs: 1 name case, 3 upper, anything else (2 too) as it is. Values that
  /// name machinery are converted as all others.
  virtual Variant ConvertCaseSuburbs(const Variant& vStr);

  /// Shows the list of the host's shortcut keys, above all other windows, and returns; a list that is open already
  /// comes to the front. Raises 445 where there is no screen.
  virtual void ShowShortCutKeys();

  /// Shows the host's command-line switches with examples, until the user closes the window. Raises 445 where there is
  /// no screen.
  virtual void ShowCmdLineHelp();

  /// A random password of iMaxLength characters; empty for 0 or less. iMix 0 draws decimal digits, 1 letters and
  /// symbols, 2 with iHex 0 letters, symbols and digits, 2 with iHex 1 hexadecimal digits; any other iMix gives an
  /// empty text. No two neighbours are the same draw, and of each mix the first and the last character come up half as
  /// often as the others. Waiting messages are handled before each draw. With iMix 2 and any other iHex the second
  /// character never comes: the call lets messages through until the thread is asked to quit, and then raises 18.
  virtual Text GenerateFilePassword(const std::int16_t& iMaxLength, const std::int16_t& iMix, const std::int16_t& iHex);

  /// Whether a normal file matches; wildcards count, and quotes around the path do not. Hidden files, system files and
  /// folders are not found. Never fails.
  virtual Boolean FileExists(Text sFilename);

  /// The part of a path after the last "\", or after a drive's colon; without bIncludeExt, up to its first dot. Quotes
  /// around the path are removed, also in vSpecIn. Never fails.
  virtual Text ExtractFilename(Text& vSpecIn, const Boolean& bIncludeExt);

  /// Copies the lines of a text file, at most 30000, into another that is replaced; every line ends in CR LF. Raises 9
  /// for a source that is missing or has no lines, and what reading and writing files raise.
  virtual void CopyFileToBackupFile(const Text& sSrcFileName, const Text& sDestFileName);

  /// Writes the elements from index 0 to the last as lines. Raises 9 for a lower bound above 0 and for an unallocated
  /// array, 76 for a missing folder, 75 for a read-only file, 70 for a locked one, 61 when the disk is full; the old
  /// file then stays.
  virtual void SaveBigFile(const TextArray& sFList, const Text& sFilename);

  /// The number of normal files that match sPath followed by sFiles ("*.*" when that is empty). A missing folder has
  /// none. Raises 52 for a pattern that cannot be searched for.
  virtual std::int32_t GetFileCount(const Text& sPath, const Text& sFiles);

  /// The same files by name, each followed by sDelimiter, in the order of the system. A delimiter of one character is
  /// removed from the end, a longer one stays. Raises 5 when the list and sDelimiter are both empty.
  virtual Text GetFileList(const Text& sDelimiter, const Text& sPath, const Text& sFiles);

  /// Reads the lines of a file into sFList from index 0 and gives their number; 0 for a missing or empty file, sFList
  /// being left alone. With iEraseBlanks exactly 1, lines that VerifyTextData empties are skipped, and the array can be
  /// one longer than the result says. Raises 9 for an array that does not start at 0.
  virtual std::int32_t OpenBigFile(const Text& sFilename, TextArray& sFList, const std::int16_t& iEraseBlanks);

  /// The same without skipping, and no more than iRowLimit lines; a limit of 0 or less is none.
  virtual std::int32_t OpenFile(const Text& sFilename, TextArray& sFList, const std::int32_t& iRowLimit);

  /// Makes every folder of a path up to its last "\". A failure is not reported, but a run-time error is shown in a
  /// message box.
  virtual void VerifyFilePath(const Text& sPath);

  /// The part of a path up to its last "\"; else the current folder of its drive or of the process, with a "\" at its
  /// end. Quotes around the path are removed, also in vSpecIn. Never fails.
  virtual Text ExtractPathName(Text& vSpecIn);

  /// Writes a text and a line break to a file that is replaced. Raises as SaveBigFile does for files.
  virtual void SaveTextBox(const Text& sText, const Text& sFilename);

  /// The text of a file up to a character 26, line ends as they are; empty for a missing file. Raises 70 for a locked
  /// one.
  virtual Text LoadTextBox(const Text& sFilename);

  /// Reads a setting. With bLoadFromFile from the profile file sFilename: the value without one leading backslash, or
  /// for an empty sItem the first name of the section; a value that then begins with two backslashes is empty. Where
  /// there is none, sDefaultData, which is also saved into the user's store (not the file); "NoDefaultData" saves
  /// nothing and gives an empty text.
  ///
  /// Without it from the user's store, sFilename selecting the group: sNatNameD and anything unknown the user's,
  /// sORVDataName the database's (all but previous settings without a user), "PreviousDatabaseSettings" and "CodeCount"
  /// their own. Where there is none, sDefaultData, which is saved; CodeCount gives an empty text. Raises what the store
  /// raises.
  virtual Text GetCfgFileData(const Text& sSection, const Text& sItem, const Text& sDefaultData, const Text& sFilename,
                              const Boolean& bLoadFromFile);

  /// Writes a setting. With bSaveToFile into the profile file sFilename, which fails without a word; an empty sOutput
  /// and one that begins with a backslash are written as a single backslash, which is written back. Without it into the
  /// user's store: the user's and the database's group, or only the one of "PreviousDatabaseSettings" or "CodeCount".
  /// Raises what the store raises.
  virtual void SaveCfgFileData(const Text& sSection, const Text& sItem, Text& sOutput, const Text& sFilename,
                               const Boolean& bSaveToFile);

  /// Packs the items of a list (see item_list.hpp) into an archive, encrypted where a password is given; 1 for
  /// iMultiVolume makes a split set. What goes wrong is shown in a message box and not reported to the caller.
  /// bUseFilePath is not used.
  virtual void CallZIPFiles(const Text& sZipName, const Text& sItems, const std::int16_t& iMultiVolume,
                            const Text& sEncryptionPassword, const Boolean& bUseFilePath);

  /// Unpacks the entries of a list, or all, below a folder. What goes wrong is shown in a message box. Encrypted
  /// entries are tried with the password of the last CallZIPFiles, then the user is asked.
  virtual void CallUnZIPFiles(const Text& sUnZipName, const Text& sDestPath, const Text& sItems,
                              const Boolean& bOverWrite);

  /// The folder that the user chooses; empty when the dialog is closed.
  virtual Text BrowseForFolder(const Text& szTitle);

  /// Draws a text on DrawTextPictureBox, whose scale is twips; nothing for an empty text. One that is wider than the
  /// rectangle is drawn from its top left corner and cut off at its edges, in several lines with bWordWrap, unless
  /// iJustify is -2. Any other stands in the middle between top and bottom.
  /// @param iDestX1, iDestY1, iDestX2, iDestY2 the rectangle, in pixels
  /// @param lColor 0x00BBGGRR, or a system colour with the highest bit set
  /// @param iJustify -2 and -1 left, 0 (and any other) centred, 1 right; see docs/drawing.md
  /// FontBold and ForeColor of the box are put back, also after an error. Raises 91 without a box, what the box raises,
  /// and 13 and 94 for what has no text.
  virtual void MyDrawText(const std::int16_t& iDestX1, const std::int16_t& iDestY1, const std::int16_t& iDestX2,
                          const std::int16_t& iDestY2, const Variant& sText, const std::int32_t& lColor,
                          const std::int16_t& iJustify, const Boolean& bBold, const Boolean& bWordWrap);
  /// Gives a form the WindowState that was saved in a section (0 where none was) and, when the form then is in its
  /// normal state, its Width and Height, in twips. Raises what the form and the store raise.
  virtual void LoadWindowState(const Variant& frm, const Text& sCFGStr);

  /// Saves a form's WindowState and, in the normal state alone, its Width and Height.
  virtual void SaveWindowState(const Variant& frm, const Text& sCFGStr);

  virtual void GridPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                const Text& sReportName, const Text& sCsvName, const Variant& ctlGrid,
                                const Variant& vStDate, const Variant& vEnDate, const Text& fWindowCaption);
  virtual void TextBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlTextBox);
  virtual void ListBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlListBox);

  /// The index of the first entry whose ItemData equals a key; -1 for none, and for a key of 0 or less. The Text of the
  /// control is emptied in any case, its selection stays. Raises what the control raises.
  virtual std::int32_t GetComboListIndex(const Variant& cboCombo, const std::int32_t& vBranchUniqueID);

  /// Has a list-combo control search for the text typed into it. 0 when there is none, -1 when it is not found, else
  /// the ListIndex of the control afterwards: that of the entry found with msgFlag 2, else the one it had before.
  /// @param msgFlag 1 reports a failed search in a message box, 2 selects the entry found
  /// Adds 1 to CounterVerifyText. Raises what the control raises, 6 for a ListIndex beyond 16 bits.
  virtual std::int32_t SearchCombo(const Variant& cboCombo, const std::int16_t& msgFlag);

  /// The same for a given text and method of the control, empty or not. Without msgFlag 2 a search that succeeds
  /// selects the first entry.
  virtual std::int32_t SearchComboEx(const Variant& cboCombo, const Text& sFind, const std::int32_t& SearchMethod,
                                     const std::int16_t& msgFlag);

  /// Gives the columns of a grid, from one on, the widths that were saved in a section; 1000 twips where none was, 0
  /// for a text that is no number. Raises what the grid and the store raise.
  virtual void LoadGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn);

  /// Saves the widths of a grid's columns from one on.
  virtual void SaveGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn);

  /// Writes the cells of a grid that are shown to a file of comma text that the user chooses, below sReportsDir.
  /// @param iDontSaveHeader the first row with bSelection; 0 also keeps the fixed cells
  /// @param bSelection True writes every row; anything else those between Row and RowSel
  /// @param sFilename names the folder and, with ".txt", the file that the dialog proposes
  /// Whatever goes wrong, and a cancelled dialog, ends it without a word; the file is then as it was.
  virtual void ExportGridData(const Variant& m_Grid1, const std::int16_t& iDontSaveHeader, const Boolean& bSelection,
                              const Text& sFilename);

  /// A date typed as eight digits DDMMYYYY, years 1900 to 2100, as text "DD/MM/YYYY"; an empty text for all else.
  virtual Variant GetDateFromString(const Text& sText);

  /// True when every character is a digit or a capital A to Z; so for an empty text.
  virtual Boolean VerifyPasswordText(const Text& sPassword);

  /// A stored duration (a date that much later than 1/1/1800 00:00) as text "hours:minutes", shortest numbers: "1:30",
  /// "26:0". A bare time of day, as durations were stored once, is written back as "1/1/1800 HH:MM"; a text is one
  /// when it begins with "30/12/1899". Raises 13 for what is no date, 94 for Null, 6 beyond 32 bits of minutes.
  virtual Variant DateTimeToDuration(Variant& vDate);

  /// A duration given as a time of day ("1:30") as it is stored: 01/01/1800 01:30. Raises 13 for what is no time of
  /// day, so for 24 hours and more.
  virtual Variant DurationToDateTime(const Variant& vDuration);

  /// A time of day as decimal hours; minutes other than 15, 30 and 45 count as none, and 0 hours become 1.5. "-" is
  /// read as "0". What is no time gives 0.
  virtual float ConvertDurationToNumber(const Variant& vT);

  /// Decimal hours as text ("1.5", ".25") as a stored duration. The fractions 5, 25 and 75 are quarters of an hour,
  /// any other is minutes: "1.50" is 1 hour 50. The text is written back without blanks at its ends. Raises 13 for
  /// what gives no time of day.
  virtual Variant DurToTime(Text& sDuration);

  /// A stored duration as decimal hours in text ("0.25"); minutes other than 15, 30 and 45 count as none, 0 becomes
  /// "1.5" and more than 24 hours "1". A bare time of day is written back as "1/1/1800 HH:MM". Raises 13 for what is
  /// no date, 6 beyond 32 bits of minutes.
  virtual Text ConvertDatabaseDurationToNumber(Variant& vDuration);

  /// Minutes, 0 to 1439, as a stored duration. Others are reported in a message box and give the text
  /// "1/1/1800 00:00".
  virtual Variant ConvertNumberToDatabaseDuration(const std::int16_t& iMinutes);

  /// A stored duration in minutes. Writes back and raises what ConvertDatabaseDurationToNumber does.
  virtual std::int32_t ConvertDatabaseDurationToMinutes(Variant& vDuration);

  /// Shows what is to be known of the machine (drives, memory, processor, operating system) and of a folder or file,
  /// until the user closes the window. Raises 445 where there is no screen.
  virtual void ShowSysInfo();

  /// Deletes the files that match; wildcards may stand in the last part. Read-only files stay. No failure is
  /// reported.
  virtual void DeleteFiles(const Text& sFileSpec);

  /// True, whatever the address: the test is switched off.
  virtual Boolean PingSite(const Text& sAddress);

  /// Adds "user:DDMMYYYYHHMMSS:event:form" to EventLog.txt in the sORVPath folder, unless EventLog is 0. Raises 76 for
  /// a missing folder, 75 for a read-only file, 61 when the disk is full.
  virtual void AppendEventLog(const Text& sEventName, const Text& sEventForm);

  /// Ticks (iSwitch 1) or clears (0) all rows of a column of check boxes, one whose ColDataType is 11; hidden rows too.
  /// An error is shown in a message box and ends it.
  virtual void SelectGridRows(const std::int32_t& lColumn, const Variant& vGrid, const std::int16_t& iSwitch);

  /// The ticked rows of a column of check boxes, hidden ones too; 0 for another column. An error is shown in a message
  /// box; the result is then what was counted before.
  virtual std::int32_t CountGridSelectedRows(const std::int32_t& lColumn, const Variant& vGrid);

  /// The text as printable cipher text, different each time; empty for an empty text. Every library reads it back; see
  /// docs/cipher-text.md.
  virtual Text CryptoEncryptString(const Text& sSourceString);

  /// The text that CryptoEncryptString was given. Raises 5, with a description of its own, for anything that is not a
  /// whole cipher text; an empty text gives an empty text.
  virtual Text CryptoDecryptString(const Text& sSourceString);

  /// The status of reading a value below the current user's hive: 0, 2 for a missing value, 6 for a key that cannot be
  /// opened, -1 for a type other than 1 (text) and 4 (number).
  virtual std::int32_t REGISTRY_QueryValue(const Text& sKeyName, const Text& sValueName);

  /// A value as text; empty where it cannot be read. No failure is reported.
  virtual Text REGISTRY_ReturnValue(const Text& sKeyName, const Text& sValueName);

  /// Writes a value of a key that exists, as type 1 or 4; other types write nothing. Raises what the conversion of the
  /// value raises (94 for Null, 13, 6), but reports no failure of the registry.
  virtual void REGISTRY_SetKeyValue(const Text& sKeyName, const Text& sValueName, const Variant& vValueSetting,
                                    const std::int32_t& lValueType);

  /// Creates a key below a predefined root (0x80000001 is the current user), or opens and closes it if it exists.
  virtual void REGISTRY_CreateNewKey(const Text& sNewKeyName, const std::int32_t& lPredefinedKey);

  /// The characters in reverse order. Raises 6 beyond 32767 characters.
  virtual Text ReverseString(const Text& sSource);

  /// With iOption 1, the position of the blank before the text part of an address line that starts with
  /// numbers ("12 SMITH ST" gives 3); 0 otherwise. Raises 6 for a position beyond 32767.
  virtual std::int16_t StringPosition(const Text& sSource, const std::int16_t& iOption);

  /// True when there is at least one digit.
  virtual Boolean NumbersInString(const Text& sSource);

  /// Asks for a text in a box that stays above all other windows; the text in clear, though bPassword shows asterisks.
  /// Empty when the box was closed by its menu. Without an entry (bShowUserInput False) OK gives the empty text. With
  /// bNoFrame and bNonCloseable both True it is a notice: the call returns at once, with the result of the box's last
  /// use, and the notice stays until Terminate. The prompt makes the box higher where it is long. lBackColor is
  /// 0x00BBGGRR, or a system colour. Raises 400 when the box is on the screen already, 445 where there is no screen.
  virtual Text MyInputBox(const Text& sCaption, const Text& sPrompt, const Boolean& bPassword,
                          const Boolean& bShowUserInput, const Boolean& bNoFrame, const Boolean& bNonCloseable,
                          const std::int32_t& lBackColor);

  /// The minutes of a time of day since midnight. Raises 13 for what is no date or time.
  virtual std::int32_t ConvertTimeToMinutes(const Variant& vTime);

  /// True when sSourceString is one of the fields of sDestString that a one-character sDelimiter closes; the
  /// text after the last delimiter is never compared. Raises 6 beyond 32767 characters.
  virtual Boolean MyInstrDelim(const Text& sSourceString, const Text& sDestString, const Text& sDelimiter);

  /// Prints a form as it looks, through printhelper.dll. Raises what the form raises, 53 when the library is missing
  /// and 453 when it lacks a function.
  virtual void PrintScreen(const Variant& vForm);

  /// Whether a folder exists; quotes around the path do not count. Never fails.
  virtual Boolean PathExists(Text sDirectory);

  /// Makes the application's folders. A configured one that cannot be made is replaced, in its setting too, by the one
  /// below C:\TAL\ORV3. A run-time error ends it; it is shown when bIsProgrammer is exactly True.
  virtual void SetupFileFolders();

  /// A new GUID: 38 characters, upper-case hexadecimal digits in braces.
  virtual Text GetNewGuid();

  /// Writes year to second of a date into a record; wDayOfWeek and wMilliseconds stay. Raises 6 for a date out of
  /// range.
  virtual void DateToSystemTime(Date the_date, SystemTime& system_time);

  /// Writes the date of a record to the_date. Parts may lie beyond their range: month 13 is the next January, day 0
  /// the last day of the month before. Years 0 to 99 are 1930 to 2029. Raises 5 where that gives no date.
  virtual void SystemTimeToDate(const SystemTime& system_time, Date& the_date);

  /// A local time as UTC and back, to the second, by the zone's offset of today whatever the date: summers and
  /// winters are not distinguished. Times before 1601 are beyond the conversion.
  virtual Date LocalTimeToUTC(Date the_date);
  virtual Date UTCToLocalTime(Date the_date);

  /// Replaces every occurrence of the whole of sChangeFrom (despite the name, without regard to words). An
  /// empty sChangeFrom changes nothing.
  virtual Text StringReplaceWord(const Text& sSource, const Text& sChangeFrom, const Text& sChangeTo);

  /// An array, from 0, of the machine's IPv4 addresses in ascending order; without elements where there are none, or
  /// more than 21.
  virtual Variant GetIpAddrTable();

  /// Cleans a memo: every line feed becomes a blank, then runs of 2, 3 and 4 blanks, line breaks and carriage
  /// returns are shortened in single passes. A line break leaves as a carriage return and a blank.
  virtual Text VerifyMemField(const Text& sMemData);

 private:
  Library& library_;
};

}  // namespace talutil
