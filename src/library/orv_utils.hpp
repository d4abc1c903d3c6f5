#pragma once

#include <cstdint>

#include "automation/system_time.hpp"
#include "automation/variant.hpp"
#include "library/shared_settings.hpp"

namespace talutil {

class Library;

/// The toolkit object that hosts create. Objects have no state of their own: settings live in the library.
///
/// Members stand in the order of their slots. The signature tells the interface: `T` is passed by value,
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

  virtual Variant SetDayOfMonth(const Variant& vDate, const std::int16_t& iDayNumber);
  virtual Text GetFinancialYearStr(const Variant& vDate);
  virtual Boolean GetWeekInDateRange(const Variant& vFromDate, const Variant& vToDate, std::int16_t& iWeek,
                                     const std::int16_t& iYear);

  /// The text between the iSt-th and the iEn-th comma; with iSt 0, the text before the iEn-th. A missing comma
  /// or a negative iSt gives an empty text, so the text after the last comma is never obtained: stored lists
  /// end with a comma. Raises 5 when the iEn-th comma does not come after the iSt-th.
  virtual Text GetData(const Text& sSrcStr, const std::int32_t& iSt, const std::int32_t& iEn);

  virtual Variant VerifyNullTime(const std::int16_t& iFlag, const Variant& vTime);
  virtual Variant VerifyNullDate(const std::int16_t& iFlag, Variant& vDate);
  virtual std::int16_t GetWeekNumber(const Variant& vDate);
  virtual Variant WeekYearToDate(std::int16_t& iWeek, const std::int16_t& iYear, const std::int16_t& iDay);
  virtual std::int16_t GetYear(const Variant& vDate);
  virtual std::int16_t GetMonth(const Variant& vDate);
  virtual std::int16_t GetDay(const Variant& vDate);
  virtual Boolean VerifyEmail(const Text& sTemp);
  virtual Boolean GetMousePos(const Variant& lngSrcX, const Variant& lngSrcY, const Variant& lngDestX1,
                              const Variant& lngDestY1, const Variant& lngDestX2, const Variant& lngDestY2);
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

  virtual std::int16_t GetDaysThisMonth(const std::int16_t& iMonth, const std::int16_t& iYear);

  /// Splits sTemp at each one-character sDelimiter into sFList, with indexes from 0, and gives the number of
  /// elements. The text after the last delimiter is dropped. Without a delimiter, and for an empty sTemp, the
  /// result is 0 and sFList keeps what it held. Raises 9 for an array that does not start at 0 or below.
  virtual std::int32_t ReadCommaDelimStrToList(const Text& sTemp, TextArray& sFList, const Text& sDelimiter);

  /// The leading number of a value as text ("12abc" gives "12"); "0" when there is none. Null gives an empty
  /// text, or "0" with iFlag 1. Adds 1 to CounterVerifyInt first; raises 6 when that is at its maximum and
  /// for a number beyond the range of a double.
  virtual Text VerifyIntData(const std::int16_t& iFlag, const Variant& vData);

  virtual Boolean IsValueNumber(const Text& sText);
  virtual Boolean IsValueDate(const Text& sText);
  virtual Boolean IsValueTime(const Text& sText);

  /// Replaces each carriage return and then each line feed by sReplace: a line break becomes two copies.
  virtual Text CRLFStringReplace(const Text& sSrc, const Text& sReplace);

  /// Undoes CRLFStringReplace for a one-character marker: each marker and the character after it become a line
  /// break. A marker at the very end gives a line break and stays. Raises 6 beyond 32767 characters.
  virtual Text StringRestoreCRLF(const Text& sSrc, const Text& sSourceCharacter);

  /// Pads with "0" up to iExpLength characters: before the text with iJustify -1, after it with 1, else not.
  virtual Text AddZeros(const Text& sText, const std::int16_t& iExpLength, const std::int16_t& iJustify);

  virtual Variant GetTimeDifference(Variant& vStDate, Variant& vEnDate, Variant& vStTime, Variant& vEnTime);
  virtual Variant IncYear(const Variant& vSrcDate, const std::int16_t& iNum);
  virtual std::int32_t GetDaysInPeriod(const Variant& vStartDate, const Variant& vEndDate);
  virtual std::int32_t GetMonthsInPeriod(const Variant& vStartDate, const Variant& vEndDate);
  virtual Variant IncDay(const Variant& vSrcDate, const std::int16_t& iNum);
  virtual Variant AddTimeToDate(const Variant& vSrcDate, const Text& sTime);
  virtual Variant IncWeek(const Variant& vSrcDate, const std::int16_t& iNum);
  virtual Variant IncMonth(const Variant& vSrcDate, const std::int16_t& iNum);
  virtual Variant GetNextDate(const Variant& vStartDate, const Variant& vStep, const Variant& vIncrement);
  virtual void DrawShellExecuteError(const std::int32_t& lRetVal);
  virtual Boolean CheckDeleteRecord();
  virtual Boolean CheckModifyDatabase(const Text& sCaption);
  virtual Variant ConvertCase(const std::int16_t& iFlag, const Variant& vStr);
  virtual Variant ConvertCaseSuburbs(const Variant& vStr);
  virtual void ShowShortCutKeys();
  virtual void ShowCmdLineHelp();
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

  virtual Text GetCfgFileData(const Text& sSection, const Text& sItem, const Text& sDefaultData, const Text& sFilename,
                              const Boolean& bLoadFromFile);
  virtual void SaveCfgFileData(const Text& sSection, const Text& sItem, Text& sOutput, const Text& sFilename,
                               const Boolean& bSaveToFile);
  virtual void CallZIPFiles(const Text& sZipName, const Text& sItems, const std::int16_t& iMultiVolume,
                            const Text& sEncryptionPassword, const Boolean& bUseFilePath);
  virtual void CallUnZIPFiles(const Text& sUnZipName, const Text& sDestPath, const Text& sItems,
                              const Boolean& bOverWrite);

  /// The folder that the user chooses; empty when the dialog is closed.
  virtual Text BrowseForFolder(const Text& szTitle);

  virtual void MyDrawText(const std::int16_t& iDestX1, const std::int16_t& iDestY1, const std::int16_t& iDestX2,
                          const std::int16_t& iDestY2, const Variant& sText, const std::int32_t& lColor,
                          const std::int16_t& iJustify, const Boolean& bBold, const Boolean& bWordWrap);
  virtual void LoadWindowState(const Variant& frm, const Text& sCFGStr);
  virtual void SaveWindowState(const Variant& frm, const Text& sCFGStr);
  virtual void GridPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                const Text& sReportName, const Text& sCsvName, const Variant& ctlGrid,
                                const Variant& vStDate, const Variant& vEnDate, const Text& fWindowCaption);
  virtual void TextBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlTextBox);
  virtual void ListBoxPrintPreview(const std::int16_t& iZoomLevel, const std::int16_t& iPrintDirection,
                                   const Text& sReportName, const Text& sCsvName, const Variant& ctlListBox);
  virtual std::int32_t GetComboListIndex(const Variant& cboCombo, const std::int32_t& vBranchUniqueID);
  virtual std::int32_t SearchCombo(const Variant& cboCombo, const std::int16_t& msgFlag);
  virtual std::int32_t SearchComboEx(const Variant& cboCombo, const Text& sFind, const std::int32_t& SearchMethod,
                                     const std::int16_t& msgFlag);
  virtual void LoadGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn);
  virtual void SaveGridWidths(const Variant& Grid1, const Text& sCFGStr, const std::int16_t& iStartColumn);
  virtual void ExportGridData(const Variant& m_Grid1, const std::int16_t& iDontSaveHeader, const Boolean& bSelection,
                              const Text& sFilename);
  virtual Variant GetDateFromString(const Text& sText);
  virtual Boolean VerifyPasswordText(const Text& sPassword);
  virtual Variant DateTimeToDuration(Variant& vDate);
  virtual Variant DurationToDateTime(const Variant& vDuration);
  virtual float ConvertDurationToNumber(const Variant& vT);
  virtual Variant DurToTime(Text& sDuration);
  virtual Text ConvertDatabaseDurationToNumber(Variant& vDuration);
  virtual Variant ConvertNumberToDatabaseDuration(const std::int16_t& iMinutes);
  virtual std::int32_t ConvertDatabaseDurationToMinutes(Variant& vDuration);
  virtual void ShowSysInfo();

  /// Deletes the files that match; wildcards may stand in the last part. Read-only files stay. Never fails and never
  /// tells.
  virtual void DeleteFiles(const Text& sFileSpec);

  virtual Boolean PingSite(const Text& sAddress);

  /// Adds "user:DDMMYYYYHHMMSS:event:form" to EventLog.txt in the sORVPath folder, unless EventLog is 0. Raises 76 for
  /// a missing folder, 75 for a read-only file, 61 when the disk is full.
  virtual void AppendEventLog(const Text& sEventName, const Text& sEventForm);

  virtual void SelectGridRows(const std::int32_t& lColumn, const Variant& vGrid, const std::int16_t& iSwitch);
  virtual std::int32_t CountGridSelectedRows(const std::int32_t& lColumn, const Variant& vGrid);
  virtual Text CryptoEncryptString(const Text& sSourceString);
  virtual Text CryptoDecryptString(const Text& sSourceString);
  virtual std::int32_t REGISTRY_QueryValue(const Text& sKeyName, const Text& sValueName);
  virtual Text REGISTRY_ReturnValue(const Text& sKeyName, const Text& sValueName);
  virtual void REGISTRY_SetKeyValue(const Text& sKeyName, const Text& sValueName, const Variant& vValueSetting,
                                    const std::int32_t& lValueType);
  virtual void REGISTRY_CreateNewKey(const Text& sNewKeyName, const std::int32_t& lPredefinedKey);

  /// The characters in reverse order. Raises 6 beyond 32767 characters.
  virtual Text ReverseString(const Text& sSource);

  /// With iOption 1, the position of the blank before the text part of an address line that starts with
  /// numbers ("12 SMITH ST" gives 3); 0 otherwise. Raises 6 for a position beyond 32767.
  virtual std::int16_t StringPosition(const Text& sSource, const std::int16_t& iOption);

  virtual Boolean NumbersInString(const Text& sSource);
  virtual Text MyInputBox(const Text& sCaption, const Text& sPrompt, const Boolean& bPassword,
                          const Boolean& bShowUserInput, const Boolean& bNoFrame, const Boolean& bNonCloseable,
                          const std::int32_t& lBackColor);
  virtual std::int32_t ConvertTimeToMinutes(const Variant& vTime);

  /// True when sSourceString is one of the fields of sDestString that a one-character sDelimiter closes; the
  /// text after the last delimiter is never compared. Raises 6 beyond 32767 characters.
  virtual Boolean MyInstrDelim(const Text& sSourceString, const Text& sDestString, const Text& sDelimiter);

  virtual void PrintScreen(const Variant& vForm);

  /// Whether a folder exists; quotes around the path do not count. Never fails.
  virtual Boolean PathExists(Text sDirectory);

  /// Makes the application's folders. A configured one that cannot be made is replaced, in its setting too, by the one
  /// below C:\TAL\ORV3. A run-time error ends it; it is shown when bIsProgrammer is exactly True.
  virtual void SetupFileFolders();

  /// A new GUID: 38 characters, upper-case hexadecimal digits in braces.
  virtual Text GetNewGuid();

  virtual void DateToSystemTime(Date the_date, SystemTime& system_time);
  virtual void SystemTimeToDate(const SystemTime& system_time, Date& the_date);
  virtual Date LocalTimeToUTC(Date the_date);
  virtual Date UTCToLocalTime(Date the_date);

  /// Replaces every occurrence of the whole of sChangeFrom (despite the name, without regard to words). An
  /// empty sChangeFrom changes nothing.
  virtual Text StringReplaceWord(const Text& sSource, const Text& sChangeFrom, const Text& sChangeTo);

  virtual Variant GetIpAddrTable();

  /// Cleans a memo: every line feed becomes a blank, then runs of 2, 3 and 4 blanks, line breaks and carriage
  /// returns are shortened in single passes. A line break leaves as a carriage return and a blank.
  virtual Text VerifyMemField(const Text& sMemData);

 private:
  Library& library_;
};

}  // namespace talutil
