#pragma once

#include <cstdint>

#include "automation/system_time.hpp"
#include "automation/variant.hpp"
#include "library/shared_settings.hpp"

namespace talutil {

class Library;

/// The toolkit object that hosts create. Objects have no state of their own: settings belong to the library.
///
/// Members are in slot order. The signature defines the interface: `T` is passed by value, `const T&` by reference and
/// never changed, `T&` by reference and written back. Members call each other through the object, so that overriding
/// one affects the others. All run-time errors leave a member as RunTimeError; whatever it had written back by then
/// stays written.
class ORVUtils {
 public:
  explicit ORVUtils(Library& library) noexcept : library_(library) {}
  ORVUtils(const ORVUtils&) = delete;
  ORVUtils& operator=(const ORVUtils&) = delete;
  virtual ~ORVUtils() = default;

  [[nodiscard]] Library& library() const noexcept { return library_; }
  [[nodiscard]] SharedSettings& settings() const noexcept;
  [[nodiscard]] Locale locale() const;

  /// Ends the host's use of the library: unloads the components window (loading it first if necessary). Before that,
  /// shows "Closing ORVUtils Components form" if DebugMode is exactly 1.
  virtual void Terminate();

  /// Cleans a value for a text field of the database: trims blanks, cuts at the first NUL, replaces "&" by "and" and
  /// the apostrophe by an acute accent, and removes the double quote, tab, "#", ">", "<" and "?".
  /// @param iMaxTextLength the field's width in characters; 0 or less for no limit
  /// @param iExtras 1 removes commas, 2 blanks, 3 both, 4 compresses to three lines, 5 drops lines with $*$
  /// @param vData the value; Null and Empty result in an empty text
  /// Adds 1 to CounterVerifyText first; raises 6 if that is at its maximum, and 13 if the value has no text form.
  virtual Text VerifyTextData(const std::int16_t& iMaxTextLength, const std::int16_t& iExtras, const Variant& vData);

  /// The text before the first NUL character; the whole text if there is none.
  virtual Text StripNulls(const Text& s);

  /// Keeps characters whose ANSI code is 65 or more: letters stay; digits, blanks and punctuation below "A" are
  /// removed.
  virtual Text RemoveNumberFromString(const Text& sTemp);

  /// Filters characters: iOption 0 keeps digits, 1 digits and blanks, 2 all characters other than sCharacter, 3 digits
  /// and full stops; any other value returns an empty text. With option 2, an empty sCharacter becomes a blank, which
  /// is written back; an sCharacter of several characters removes nothing.
  virtual Text RemoveStringsFromNumber(const std::int16_t& iOption, const Text& sTemp, Text& sCharacter);

  /// Replaces every character whose ANSI code equals that of the first character of sChr by all of sReplace. Raises 5
  /// if sChr is empty, unless sSrc is empty.
  virtual Text StringReplace(const Text& sSrc, const Text& sChr, const Text& sReplace);

  /// The date moved to another day of its month, as text "DD/MM/YYYY". If the month has no such day, the text is
  /// returned as first put together: "31/2/2009". Raises 13 if vDate is not a date, 94 if it is Null.
  virtual Variant SetDayOfMonth(const Variant& vDate, const std::int16_t& iDayNumber);

  /// The financial year (1 July to 30 June) of a date, with two digits per year: 15/08/2009 returns "0910". Centuries
  /// do not wrap: 01/07/1999 returns "99100" and 01/03/2000 "-100". Raises 13 if vDate is not a date.
  virtual Text GetFinancialYearStr(const Variant& vDate);

  /// True if vFromDate is on or before the date that WeekYearToDate returns for the week with iDay 0, or vToDate is on
  /// or after it; so it is False only for a range that runs backwards around that date. An iWeek outside 1 to 52 is
  /// written back as the nearest of these. Raises 13 if an argument is not a date, 94 for Null.
  virtual Boolean GetWeekInDateRange(const Variant& vFromDate, const Variant& vToDate, std::int16_t& iWeek,
                                     const std::int16_t& iYear);

  /// The text between the iSt-th and the iEn-th comma; with iSt 0, the text before the iEn-th. A missing comma or a
  /// negative iSt returns an empty text, so the text after the last comma is never returned: stored lists end with a
  /// comma. Raises 5 if the iEn-th comma does not come after the iSt-th.
  virtual Text GetData(const Text& sSrcStr, const std::int32_t& iSt, const std::int32_t& iEn);

  /// A time of day as text "HH:MM"; "01:30" if vTime is not a date or time, whatever iFlag is. Adds 1 to
  /// CounterVerifyTime first; raises 6 if that is at its maximum, and nothing else.
  virtual Variant VerifyNullTime(const std::int16_t& iFlag, const Variant& vTime);

  /// A date as the screens show it, as text. If vDate is not a date, is midnight of 01/01/1980, or is earlier, returns
  /// the date (not text) 01/01/1980. During the rest of that day the text is empty, except in modes 1 to 3.
  /// @param iFlag 1 shows 01/01/1980 during that day, 2 shows "DD/MM/YYYY HH:MM", 3 shows the current date and time
  /// during that day, 4 shows "DDMMYYYY", any other "DD/MM/YYYY"
  /// @param vDate the text "00:00:00" is written back as "01/01/1980"
  /// Adds 1 to CounterVerifyDate first; raises 6 if that is at its maximum, and nothing else.
  virtual Variant VerifyNullDate(const std::int16_t& iFlag, Variant& vDate);

  /// The week of a date: days 1 to 7 of the year are week 1, and everything after week 51 is week 52. Null and an empty
  /// text return 1. Raises 13 if vDate is not a date.
  virtual std::int16_t GetWeekNumber(const Variant& vDate);

  /// A date in a week. Weeks are laid out by the calendar of the current year (common or leap), whatever iYear is.
  /// @param iWeek 1 to 52; any other is written back as the nearest of these
  /// @param iDay 1 returns the first day and 2 the last (of week 52, 31 December), as dates; 0 returns the first day of
  /// the following week, as text "DD/MM/YYYY", by the calendar of iYear; any other returns Empty
  /// Raises 13 for an invalid year.
  virtual Variant WeekYearToDate(std::int16_t& iWeek, const std::int16_t& iYear, const std::int16_t& iDay);

  /// The parts of a date; 2000, 1 and 1 for Null and for an empty text. Raise 13 if vDate is not a date.
  virtual std::int16_t GetYear(const Variant& vDate);
  virtual std::int16_t GetMonth(const Variant& vDate);
  virtual std::int16_t GetDay(const Variant& vDate);

  /// True for an empty address, and for one with an "@" and a "." anywhere, in any order.
  virtual Boolean VerifyEmail(const Text& sTemp);

  /// True if a point is strictly inside a rectangle, not on its edge. False if an argument is Null. Texts are compared
  /// as texts, and a number is less than any text. Raises 13 for values that cannot be compared.
  virtual Boolean GetMousePos(const Variant& lngSrcX, const Variant& lngSrcY, const Variant& lngDestX1,
                              const Variant& lngDestY1, const Variant& lngDestX2, const Variant& lngDestY2);

  /// The number of pages that rows need, counted in single precision: inexact above 2^24 pages. Raises 11 if
  /// iRowsPerPage is 0.
  virtual std::int32_t GetMaxPages(const std::int32_t& iRowsPerPage, const std::int32_t& iRowCount);

  /// The index of the first element that begins with sText, ignoring case; -1 if there is none. An empty sText matches
  /// element 0. The search starts at index 0 whatever the lower bound is: raises 9 if the lower bound is above 0 or the
  /// array is unallocated.
  virtual std::int32_t IndexInList(const TextArray& sFList, const Text& sText);

  /// The position (from 1) of the iCount-th character of s2 that equals the one-character s1; 0 if there are fewer. The
  /// count is checked after every character, matching or not, so an iCount of 0 returns 1 unless the first character
  /// matches.
  virtual std::int32_t MyPos(const Text& s1, const Text& s2, const std::int32_t& iCount);

  /// The number of occurrences of the one-character sSubStr in sSrcStr; 0 if sSubStr has any other length.
  virtual std::int32_t SubStrCount(const Text& sSubStr, const Text& sSrcStr);

  /// The number of days in a month, 28 to 31; 28 if month or year is 0. Raises 9 for a month outside 1 to 12.
  virtual std::int16_t GetDaysThisMonth(const std::int16_t& iMonth, const std::int16_t& iYear);

  /// Splits sTemp at each one-character sDelimiter into sFList, with indexes from 0, and returns the number of
  /// elements. The text after the last delimiter is dropped. If there is no delimiter, or sTemp is empty, returns 0 and
  /// leaves sFList unchanged. Raises 9 for an array whose lower bound is above 0.
  virtual std::int32_t ReadCommaDelimStrToList(const Text& sTemp, TextArray& sFList, const Text& sDelimiter);

  /// The number at the start of a value, as text ("12abc" returns "12"); "0" if there is none. Null returns an empty
  /// text, or "0" with iFlag 1. Adds 1 to CounterVerifyInt first; raises 6 if that is at its maximum, and for a number
  /// beyond the range of a double.
  virtual Text VerifyIntData(const std::int16_t& iFlag, const Variant& vData);

  /// True for a text that consists of digits and full stops: "1.2.3" and "." pass; a sign, a blank, a comma or an empty
  /// text fails.
  virtual Boolean IsValueNumber(const Text& sText);

  /// True for the form day/month/year in digits, with "/" or "-" in between; ranges are not checked: 99/99/9999 passes.
  /// A two-digit day with a one-digit month fails (12/3/2024), as hosts have always seen it.
  virtual Boolean IsValueDate(const Text& sText);

  /// True for one or two digits of hours, ":" and minutes; seconds fail, ranges are not checked.
  virtual Boolean IsValueTime(const Text& sText);

  /// Replaces each carriage return and then each line feed by sReplace; a line break becomes two copies.
  virtual Text CRLFStringReplace(const Text& sSrc, const Text& sReplace);

  /// Reverses CRLFStringReplace for a one-character marker: each marker and the character after it become a line
  /// break. A marker at the very end adds a line break but stays. Raises 6 beyond 32767 characters.
  virtual Text StringRestoreCRLF(const Text& sSrc, const Text& sSourceCharacter);

  /// Pads with "0" to iExpLength characters: before the text if iJustify is -1, after it if 1, otherwise not at all.
  virtual Text AddZeros(const Text& sText, const std::int16_t& iExpLength, const std::int16_t& iJustify);

  /// The hours and minutes between two dates and times, as text "1:30"; both are negative if the second is earlier:
  /// "-1:-30". Days count only if the text of the end date sorts after that of the start date: 31/01/2024 to 01/02/2024
  /// counts none. The dates are written back as "DD/MM/YYYY" and the times as "HH:MM", in the order of the arguments,
  /// until one cannot be read. Raises 13 if an argument is not a date or time, 6 beyond 32 bits of minutes.
  virtual Variant GetTimeDifference(Variant& vStDate, Variant& vEnDate, Variant& vStTime, Variant& vEnTime);

  /// The date iNum years later, as text "DD/MM/YYYY"; 29 February becomes the 28th in common years. A year below 100 is
  /// expanded like a two-digit year, and a year beyond 9999 results in text that is not a date. Raises 13 if vSrcDate
  /// is not a date, 6 for a year beyond 16 bits.
  virtual Variant IncYear(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The number of days between two dates, ignoring times of day, in either order; -1 if either is empty. Raises 13 if
  /// an argument is not a date, including Null, and 6 if one of two different dates is 31/12/9999.
  virtual std::int32_t GetDaysInPeriod(const Variant& vStartDate, const Variant& vEndDate);

  /// The number of month boundaries between two dates, in either order; -1 for equal dates and if either is empty.
  /// Raises the same errors as GetDaysInPeriod.
  virtual std::int32_t GetMonthsInPeriod(const Variant& vStartDate, const Variant& vEndDate);

  /// The date iNum days later, as text "DD/MM/YYYY"; for years see IncYear. Raises 13 if vSrcDate is not a date, 6 for
  /// -32768 days.
  virtual Variant IncDay(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The day of a date at the time sTime, as text "DD/MM/YYYY HH:MM"; any time of the date is replaced. Raises 13 if an
  /// argument is not a date or time.
  virtual Variant AddTimeToDate(const Variant& vSrcDate, const Text& sTime);

  /// IncDay by seven times iNum; raises 6 outside -4681 to 4681.
  virtual Variant IncWeek(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The date iNum months later, as text "DD/MM/YYYY", on the same day of the month or its last: a month before 31
  /// March is 28 February. Raises 13 if vSrcDate is not a date, 6 for -32768 months.
  virtual Variant IncMonth(const Variant& vSrcDate, const std::int16_t& iNum);

  /// The date one step of a repetition later, as text "DD/MM/YYYY".
  /// @param vStep "Years" or "Yearly", "Months" or "Monthly", "Weeks" or "Weekly", "Days" or "Daily", case-sensitive;
  /// any other word returns "30/12/1899"
  /// @param vIncrement the number of years, months and so on, as a 16-bit integer
  /// Raises the errors of the corresponding Inc member, and 6, 13 or 94 for an invalid increment.
  virtual Variant GetNextDate(const Variant& vStartDate, const Variant& vStep, const Variant& vIncrement);

  /// Shows what a return value of the platform's function for starting programs means: 0, 2, 3, 5, 6, 8, 10 to 16 and
  /// 19 to 21 have a message, others show nothing. The texts are from the platform's documentation of the function, as
  /// hosts' users know them.
  virtual void DrawShellExecuteError(const std::int32_t& lRetVal);

  /// Asks the user to type YES in upper case; True if they do. Anything else, including cancelling the box, shows a
  /// warning from which they can return to the box or give up (False). Where there is nobody to ask, returns False.
  virtual Boolean CheckDeleteRecord();

  /// The same for a change to the database, with sCaption in the title of the box.
  virtual Boolean CheckModifyDatabase(const Text& sCaption);

  /// A name in the case style of iCharactercase: 1 name case, 2 lower, 3 upper, anything else unchanged; with iFlag 1
  /// always name case, unless the style is 0 or less. The value is first cleaned by VerifyTextData (which counts in
  /// CounterVerifyText). Values that name machinery, are empty or Null, or are not to be converted are returned
  /// unchanged. Raises 13 if the value has no text form, and the errors of the name-case converter.
  virtual Variant ConvertCase(const std::int16_t& iFlag, const Variant& vStr);

  /// The same for suburbs, with iCharacterCaseSuburbs: 1 name case, 3 upper, anything else (including 2) unchanged.
  /// Values that name machinery are converted like any others.
  virtual Variant ConvertCaseSuburbs(const Variant& vStr);

  /// Shows the list of the host's shortcut keys, above all other windows, and returns; if it is already open, it comes
  /// to the front. Raises 445 where there is no screen.
  virtual void ShowShortCutKeys();

  /// Shows the host's command-line switches with examples until the user closes the window. Raises 445 where there is
  /// no screen.
  virtual void ShowCmdLineHelp();

  /// A random password of iMaxLength characters; empty for 0 or less. iMix 0 draws decimal digits, 1 letters and
  /// symbols, 2 with iHex 0 letters, symbols and digits, 2 with iHex 1 hexadecimal digits; any other iMix returns an
  /// empty text. Two successive draws are never equal, and the first and last character of each mix are half as
  /// frequent as the others. Waiting messages are handled before each draw. With iMix 2 and any other iHex the second
  /// character is never found: the call handles messages until the thread is asked to quit, and then raises 18.
  virtual Text GenerateFilePassword(const std::int16_t& iMaxLength, const std::int16_t& iMix, const std::int16_t& iHex);

  /// Whether a normal file matches; wildcards are allowed, and quotes around the path are ignored. Hidden files, system
  /// files and folders are not found. Never fails.
  virtual Boolean FileExists(Text sFilename);

  /// The part of a path after the last "\", or after a drive's colon; without bIncludeExt, up to its first dot. Quotes
  /// around the path are removed, in vSpecIn as well. Never fails.
  virtual Text ExtractFilename(Text& vSpecIn, const Boolean& bIncludeExt);

  /// Copies at most 30000 lines of a text file to another, which is replaced; every line ends in CR LF. Raises 9 if the
  /// source is missing or has no lines, and the errors of reading and writing files.
  virtual void CopyFileToBackupFile(const Text& sSrcFileName, const Text& sDestFileName);

  /// Writes the elements from index 0 to the last, one per line. Raises 9 if the lower bound is above 0 or the array is
  /// unallocated, 76 for a missing folder, 75 for a read-only file, 70 for a locked one, 61 if the disk is full; an
  /// existing file then stays.
  virtual void SaveBigFile(const TextArray& sFList, const Text& sFilename);

  /// The number of normal files that match sPath followed by sFiles ("*.*" if that is empty). A missing folder has
  /// none. Raises 52 for an invalid pattern.
  virtual std::int32_t GetFileCount(const Text& sPath, const Text& sFiles);

  /// The names of the same files, each followed by sDelimiter, in the system's order. A one-character delimiter is
  /// removed from the end, a longer one stays. Raises 5 if the list and sDelimiter are both empty.
  virtual Text GetFileList(const Text& sDelimiter, const Text& sPath, const Text& sFiles);

  /// Reads the lines of a file into sFList from index 0 and returns their number. For a missing or empty file, returns
  /// 0 and leaves sFList unchanged. If iEraseBlanks is exactly 1, lines that are empty after VerifyTextData are
  /// skipped, and the array may have one more element than the result says. Raises 9 for an array that does not start
  /// at 0.
  virtual std::int32_t OpenBigFile(const Text& sFilename, TextArray& sFList, const std::int16_t& iEraseBlanks);

  /// The same without skipping, up to iRowLimit lines; 0 or less means no limit.
  virtual std::int32_t OpenFile(const Text& sFilename, TextArray& sFList, const std::int32_t& iRowLimit);

  /// Creates every folder of a path up to its last "\". Failure is not reported, but a run-time error is shown in a
  /// message box.
  virtual void VerifyFilePath(const Text& sPath);

  /// The part of a path up to its last "\"; without one, the current folder of its drive or of the process, with a
  /// trailing "\". Quotes around the path are removed, in vSpecIn as well. Never fails.
  virtual Text ExtractPathName(Text& vSpecIn);

  /// Writes a text and a line break to a file, which is replaced. Raises the same file errors as SaveBigFile.
  virtual void SaveTextBox(const Text& sText, const Text& sFilename);

  /// The text of a file up to a character 26, with line ends unchanged; empty for a missing file. Raises 70 for a
  /// locked file.
  virtual Text LoadTextBox(const Text& sFilename);

  /// Reads a setting. With bLoadFromFile, from the profile file sFilename: the value without one leading backslash or,
  /// if sItem is empty, the first name in the section; a value that then begins with two backslashes is returned empty.
  /// If there is none, returns sDefaultData, which is also saved to the user's store (not the file); with
  /// "NoDefaultData", returns an empty text and saves nothing.
  ///
  /// Otherwise from the user's store, where sFilename selects the group: sNatNameD and anything unknown the user's,
  /// sORVDataName the database's (without a user, all but the previous settings come from there),
  /// "PreviousDatabaseSettings" and "CodeCount" their own. If there is none, returns sDefaultData, which is saved; for
  /// CodeCount, returns an empty text. Raises the store's errors.
  virtual Text GetCfgFileData(const Text& sSection, const Text& sItem, const Text& sDefaultData, const Text& sFilename,
                              const Boolean& bLoadFromFile);

  /// Writes a setting. With bSaveToFile, to the profile file sFilename, which fails silently; an sOutput that is empty
  /// or begins with a backslash is written as a single backslash, which is written back. Otherwise to the user's store:
  /// to the user's and the database's group, or only to that of "PreviousDatabaseSettings" or "CodeCount". Raises the
  /// store's errors.
  virtual void SaveCfgFileData(const Text& sSection, const Text& sItem, Text& sOutput, const Text& sFilename,
                               const Boolean& bSaveToFile);

  /// Packs the items of a list (see item_list.hpp) into an archive, encrypted if there is a password; iMultiVolume 1
  /// creates a split set. Errors are shown in a message box and not reported to the caller. bUseFilePath is not used.
  virtual void CallZIPFiles(const Text& sZipName, const Text& sItems, const std::int16_t& iMultiVolume,
                            const Text& sEncryptionPassword, const Boolean& bUseFilePath);

  /// Unpacks the entries of a list, or all, to a folder. Errors are shown in a message box. Encrypted entries are tried
  /// with the password of the last CallZIPFiles; if that fails, the user is asked.
  virtual void CallUnZIPFiles(const Text& sUnZipName, const Text& sDestPath, const Text& sItems,
                              const Boolean& bOverWrite);

  /// The folder that the user chooses; empty if the dialog is cancelled.
  virtual Text BrowseForFolder(const Text& szTitle);

  /// Draws a text on DrawTextPictureBox, whose scale must be twips; does nothing for an empty text. A text wider than
  /// the rectangle is drawn from its top left corner and clipped to it, in several lines with bWordWrap, unless
  /// iJustify is -2. Any other text is centred vertically.
  /// @param iDestX1, iDestY1, iDestX2, iDestY2 the rectangle, in pixels
  /// @param lColor 0x00BBGGRR, or a system colour with the highest bit set
  /// @param iJustify -2 and -1 left, 0 (and any other) centred, 1 right; see docs/drawing.md
  /// FontBold and ForeColor of the box are restored, even after an error. Raises 91 if there is no box, the box's
  /// errors, and 13 and 94 if sText has no text form.
  virtual void MyDrawText(const std::int16_t& iDestX1, const std::int16_t& iDestY1, const std::int16_t& iDestX2,
                          const std::int16_t& iDestY2, const Variant& sText, const std::int32_t& lColor,
                          const std::int16_t& iJustify, const Boolean& bBold, const Boolean& bWordWrap);
  /// Sets a form's WindowState to the value saved in a section (0 if there is none) and, if the form is then in its
  /// normal state, its Width and Height, in twips. Raises the errors of the form and the store.
  virtual void LoadWindowState(const Variant& frm, const Text& sCFGStr);

  /// Saves a form's WindowState and, only in its normal state, its Width and Height.
  virtual void SaveWindowState(const Variant& frm, const Text& sCFGStr);

  virtual void GridPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                const Text& sReportName, const Text& sCsvName, const Variant& ctlGrid,
                                const Variant& vStDate, const Variant& vEnDate, const Text& fWindowCaption);
  virtual void TextBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlTextBox);
  virtual void ListBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlListBox);

  /// The index of the first entry whose ItemData equals a key; -1 if there is none, and for a key of 0 or less. Always
  /// clears the control's Text; its selection stays. Raises the control's errors.
  virtual std::int32_t GetComboListIndex(const Variant& cboCombo, const std::int32_t& vBranchUniqueID);

  /// Makes a list-combo control search for the text typed into it. Returns 0 if there is no text, -1 if it is not
  /// found, otherwise the control's ListIndex afterwards: that of the entry found with msgFlag 2, otherwise the
  /// previous one.
  /// @param msgFlag 1 reports a failed search in a message box, 2 selects the entry found
  /// Adds 1 to CounterVerifyText. Raises the control's errors, 6 for a ListIndex beyond 16 bits.
  virtual std::int32_t SearchCombo(const Variant& cboCombo, const std::int16_t& msgFlag);

  /// The same for a given text, empty or not, and a given search method of the control. Without msgFlag 2, a successful
  /// search selects the first entry.
  virtual std::int32_t SearchComboEx(const Variant& cboCombo, const Text& sFind, const std::int32_t& SearchMethod,
                                     const std::int16_t& msgFlag);

  /// Sets the widths of a grid's columns, from iStartColumn on, to those saved in a section; 1000 twips if none was
  /// saved, 0 for a text that is not a number. Raises the errors of the grid and the store.
  virtual void LoadGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn);

  /// Saves the widths of a grid's columns from iStartColumn on.
  virtual void SaveGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn);

  /// Writes the visible cells of a grid as comma-separated text to a file that the user chooses, starting in
  /// sReportsDir.
  /// @param iDontSaveHeader the first row with bSelection; 0 also keeps the fixed cells
  /// @param bSelection True writes every row; anything else those from Row to RowSel
  /// @param sFilename names the folder and, with ".txt", the file that the dialog suggests
  /// Any error, or a cancelled dialog, ends it silently; an existing file then stays as it was.
  virtual void ExportGridData(const Variant& m_Grid1, const std::int16_t& iDontSaveHeader, const Boolean& bSelection,
                              const Text& sFilename);

  /// A date typed as eight digits DDMMYYYY, years 1900 to 2100, as text "DD/MM/YYYY"; an empty text for anything else.
  virtual Variant GetDateFromString(const Text& sText);

  /// True if every character is a digit or a capital A to Z, and so for an empty text.
  virtual Boolean VerifyPasswordText(const Text& sPassword);

  /// A stored duration (a date that is later than 1/1/1800 00:00 by the duration) as text "hours:minutes", in shortest
  /// form: "1:30", "26:0". A bare time of day, the former way to store durations, is written back as "1/1/1800 HH:MM";
  /// a text counts as one if it begins with "30/12/1899". Raises 13 if vDate is not a date, 94 for Null, 6 beyond 32
  /// bits of minutes.
  virtual Variant DateTimeToDuration(Variant& vDate);

  /// Converts a duration given as a time of day or as "hours:minutes" ("1:30", "26:0") to the stored form: 01/01/1800
  /// 01:30. Raises 13 if it is neither.
  virtual Variant DurationToDateTime(const Variant& vDuration);

  /// A time of day as decimal hours; minutes other than 15, 30 and 45 are ignored, and 0 hours become 1.5. "-" is read
  /// as "0". Returns 0 if vT is not a time.
  virtual float ConvertDurationToNumber(const Variant& vT);

  /// Converts decimal hours in a text ("1.5", ".25") to a stored duration. The fractions 5, 25 and 75 are quarters of
  /// an hour; any other is taken as minutes: "1.50" is 1 hour 50. The text is written back trimmed. Raises 13 if the
  /// result is not "hours:minutes".
  virtual Variant DurToTime(Text& sDuration);

  /// A stored duration as decimal hours in a text ("0.25"); minutes other than 15, 30 and 45 are ignored, 0 becomes
  /// "1.5" and more than 24 hours become "1". A bare time of day is written back as "1/1/1800 HH:MM". Raises 13 if
  /// vDuration is not a date, 6 beyond 32 bits of minutes.
  virtual Text ConvertDatabaseDurationToNumber(Variant& vDuration);

  /// Converts minutes to a stored duration. Errors are reported in a message box and return the text "1/1/1800 00:00".
  virtual Variant ConvertNumberToDatabaseDuration(const std::int16_t& iMinutes);

  /// A stored duration in minutes. Writes back and raises the same as ConvertDatabaseDurationToNumber.
  virtual std::int32_t ConvertDatabaseDurationToMinutes(Variant& vDuration);

  /// Shows information about the machine (drives, memory, processor, operating system) and about a folder or file until
  /// the user closes the window. Raises 445 where there is no screen.
  virtual void ShowSysInfo();

  /// Deletes the files that match; wildcards are allowed in the last part. Read-only files stay. Failures are not
  /// reported.
  virtual void DeleteFiles(const Text& sFileSpec);

  /// True, whatever the address is: the test is disabled.
  virtual Boolean PingSite(const Text& sAddress);

  /// Appends "user:DDMMYYYYHHMMSS:event:form" to EventLog.txt in the sORVPath folder, unless EventLog is 0. Raises 76
  /// for a missing folder, 75 for a read-only file, 61 if the disk is full.
  virtual void AppendEventLog(const Text& sEventName, const Text& sEventForm);

  /// Ticks (iSwitch 1) or clears (0) all rows in a column of check boxes (with ColDataType 11), including hidden rows.
  /// An error is shown in a message box and stops the operation.
  virtual void SelectGridRows(const std::int32_t& lColumn, const Variant& vGrid, const std::int16_t& iSwitch);

  /// The number of ticked rows in a column of check boxes, including hidden rows; 0 for another column. An error is
  /// shown in a message box; the result is then the number counted before it.
  virtual std::int32_t CountGridSelectedRows(const std::int32_t& lColumn, const Variant& vGrid);

  /// The text as printable cipher text, different each time; empty for an empty text. Any instance of the library can
  /// decrypt it; see docs/cipher-text.md.
  virtual Text CryptoEncryptString(const Text& sSourceString);

  /// The text that was passed to CryptoEncryptString. Raises 5, with a description of its own, for anything but a
  /// complete cipher text; an empty text returns an empty text.
  virtual Text CryptoDecryptString(const Text& sSourceString);

  /// The status of reading a value below the current user's hive: 0, 2 for a missing value, 6 for a key that cannot be
  /// opened, -1 for a type other than 1 (text) and 4 (number).
  virtual std::int32_t REGISTRY_QueryValue(const Text& sKeyName, const Text& sValueName);

  /// A value as text; empty if it cannot be read. Failures are not reported.
  virtual Text REGISTRY_ReturnValue(const Text& sKeyName, const Text& sValueName);

  /// Writes a value of an existing key, as type 1 or 4; other types write nothing. Raises the errors of converting the
  /// value (94 for Null, 13, 6), but does not report failures of the registry.
  virtual void REGISTRY_SetKeyValue(const Text& sKeyName, const Text& sValueName, const Variant& vValueSetting,
                                    const std::int32_t& lValueType);

  /// Creates a key below a predefined root (0x80000001 is the current user), or opens and closes it if it exists.
  virtual void REGISTRY_CreateNewKey(const Text& sNewKeyName, const std::int32_t& lPredefinedKey);

  /// The characters in reverse order. Raises 6 beyond 32767 characters.
  virtual Text ReverseString(const Text& sSource);

  /// With iOption 1, the position of the blank before the text part of an address line that starts with numbers ("12
  /// SMITH ST" returns 3); otherwise 0. Raises 6 for a position beyond 32767.
  virtual std::int16_t StringPosition(const Text& sSource, const std::int16_t& iOption);

  /// True if there is at least one digit.
  virtual Boolean NumbersInString(const Text& sSource);

  /// Asks for a text in a box that stays above all other windows. Returns the text in clear, even if bPassword shows
  /// asterisks; empty if the box was closed by its menu. Without an entry (bShowUserInput False), OK returns an empty
  /// text. With bNoFrame and bNonCloseable both True it is a notice: the call returns at once, with the result of the
  /// box's last use, and the notice stays until the host closes its window. A long prompt makes the box higher.
  /// lBackColor is 0x00BBGGRR, or a system colour. Raises 400 if the box is already on the screen, 445 where there is
  /// no screen.
  virtual Text MyInputBox(const Text& sCaption, const Text& sPrompt, const Boolean& bPassword,
                          const Boolean& bShowUserInput, const Boolean& bNoFrame, const Boolean& bNonCloseable,
                          const std::int32_t& lBackColor);

  /// The number of minutes from midnight to a time of day. Raises 13 if vTime is not a date or time.
  virtual std::int32_t ConvertTimeToMinutes(const Variant& vTime);

  /// True if sSourceString is one of the fields of sDestString that end with the one-character sDelimiter; the text
  /// after the last delimiter is not compared. Raises 6 beyond 32767 characters.
  virtual Boolean MyInstrDelim(const Text& sSourceString, const Text& sDestString, const Text& sDelimiter);

  /// Prints a form as it appears, through printhelper.dll. Raises the form's errors, 53 if the library is missing and
  /// 453 if it lacks a function.
  virtual void PrintScreen(const Variant& vForm);

  /// Whether a folder exists; quotes around the path are ignored. Never fails.
  virtual Boolean PathExists(Text sDirectory);

  /// Creates the application's folders. A configured folder that cannot be created is replaced, in its setting too, by
  /// the one below C:\TAL\ORV3. A run-time error stops this; it is shown if bIsProgrammer is exactly True.
  virtual void SetupFileFolders();

  /// A new GUID: 38 characters, upper-case hexadecimal digits in braces.
  virtual Text GetNewGuid();

  /// Writes the year to second of a date to a record; wDayOfWeek and wMilliseconds stay. Raises 6 for a date out of
  /// range.
  virtual void DateToSystemTime(Date the_date, SystemTime& system_time);

  /// Writes the date of a record to the_date. Parts may be out of range: month 13 is the following January, day 0 the
  /// last day of the previous month. Years 0 to 99 are 1930 to 2029. Raises 5 if the result is not a date.
  virtual void SystemTimeToDate(const SystemTime& system_time, Date& the_date);

  /// Convert local time to UTC and back, to the second, using today's UTC offset whatever the date is: summer and
  /// winter time are not distinguished. Times before 1601 cannot be converted.
  virtual Date LocalTimeToUTC(Date the_date);
  virtual Date UTCToLocalTime(Date the_date);

  /// Replaces every occurrence of sChangeFrom as a whole (despite the name, regardless of word boundaries). An empty
  /// sChangeFrom changes nothing.
  virtual Text StringReplaceWord(const Text& sSource, const Text& sChangeFrom, const Text& sChangeTo);

  /// An array, starting at 0, of the machine's IPv4 addresses in ascending order; without elements if there are none,
  /// or more than 21.
  virtual Variant GetIpAddrTable();

  /// Cleans a memo: every line feed becomes a blank, then runs of 2, 3 and 4 blanks, line breaks and carriage returns
  /// are shortened, each in a single pass. A line break ends up as a carriage return and a blank.
  virtual Text VerifyMemField(const Text& sMemData);

 private:
  Library& library_;
};

}  // namespace talutil
