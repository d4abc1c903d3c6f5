#pragma once

#include <cstdint>

#include "automation/boolean.hpp"
#include "automation/date.hpp"
#include "automation/object.hpp"
#include "automation/text.hpp"

namespace talutil {

/// The settings that hosts set in the library. There is one block per loaded library: all objects in a process share
/// their properties. Only the host, and the members named here, ever change one. Before its first put a text is empty,
/// a number 0 and a Boolean False. A put converts its value to the property's type and raises 13, 6 or 94 (Null) if it
/// cannot. The published names are kept as they are.
struct SharedSettings {
  /// Reports during an unattended month-end run: with True, GridPrintPreview writes PDF files and opens no window. Only
  /// the captions "BankSummaryReport", "SalesReport" and "BadDebtsReport" write a file, of that name, in the folder
  /// C:\TAL\ORV3\DATA\MONTHLYREPORTS; a report with another caption is made and dropped. Text boxes and lists are shown
  /// as always. Set it back to False at the end of the run.
  /// @family settings
  /// @see GridPrintPreview, TextBoxPrintPreview, ListBoxPrintPreview
  /// @example
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 2
  ///     g.AddItem "March" & vbTab & "1250"
  ///     u.AutomatedEndOfMonth = True
  ///     u.GridPrintPreview 100, 1, "Sales", "", g, Empty, Empty, "SalesReport"
  ///     Print u.FileExists("C:\TAL\ORV3\DATA\MONTHLYREPORTS\SalesReport.pdf")
  ///     ' True
  Boolean AutomatedEndOfMonth;

  /// The host's count of configuration reads, kept for it: the library never changes it, not even in GetCfgFileData.
  /// @family settings
  /// @see CounterSaveCFG, GetCfgFileData
  /// @example
  ///     u.CounterGetCFG = u.CounterGetCFG + 1
  ///     u.CounterGetCFG = 7
  ///     Print u.CounterGetCFG
  ///     ' 7
  std::int32_t CounterGetCFG = 0;

  /// The host's count of configuration writes, kept for it: the library never changes it, not even in SaveCfgFileData.
  /// @family settings
  /// @see CounterGetCFG, SaveCfgFileData
  /// @example
  ///     u.CounterSaveCFG = 3
  ///     Print u.CounterSaveCFG
  ///     ' 3
  std::int32_t CounterSaveCFG = 0;

  /// How often VerifyTextData was called since the host last set this counter; failed calls count, too. ConvertCase,
  /// ConvertCaseSuburbs, SearchCombo, and OpenBigFile when it leaves out blank lines, call it and so add to it. At
  /// 2147483647 the next of these calls raises 6.
  /// @family settings
  /// @see CounterVerifyInt, VerifyTextData
  /// @example
  ///     u.CounterVerifyText = 0
  ///     Print u.VerifyTextData(10, 0, " Smith ")
  ///     ' Smith
  ///     Print u.CounterVerifyText
  ///     ' 1
  std::int32_t CounterVerifyText = 0;

  /// How often VerifyIntData was called since the host last set this counter; failed calls count, too. At 2147483647
  /// the next call raises 6.
  /// @family settings
  /// @see CounterVerifyText, VerifyIntData
  /// @example
  ///     u.CounterVerifyInt = 10
  ///     Print u.VerifyIntData(0, "12")
  ///     ' 12
  ///     Print u.CounterVerifyInt
  ///     ' 11
  std::int32_t CounterVerifyInt = 0;

  /// How often VerifyNullDate was called since the host last set this counter; failed calls count, too. At 2147483647
  /// the next call raises 6.
  /// @family settings
  /// @see CounterVerifyTime, VerifyNullDate
  /// @example
  ///     u.CounterVerifyDate = 0
  ///     Print u.VerifyNullDate(0, "5/3/2009")
  ///     ' 05/03/2009
  ///     Print u.CounterVerifyDate
  ///     ' 1
  std::int32_t CounterVerifyDate = 0;

  /// How often VerifyNullTime was called since the host last set this counter; failed calls count, too. At 2147483647
  /// the next call raises 6.
  /// @family settings
  /// @see CounterVerifyDate, VerifyNullTime
  /// @example
  ///     u.CounterVerifyTime = 0
  ///     Print u.VerifyNullTime(0, "9:30")
  ///     ' 09:30
  ///     Print u.CounterVerifyTime
  ///     ' 1
  std::int32_t CounterVerifyTime = 0;

  /// The sales tax rate, kept for the host; the library does not use it. It is single precision: about seven digits
  /// survive.
  /// @family settings
  /// @example
  ///     u.GSTValue = 12.5
  ///     Print u.GSTValue
  ///     ' 12.5
  float GSTValue = 0;

  /// The form on which the host chooses folders, kept for the host; it can be set but not read. A form is any object
  /// with the property hwnd. Set it with Set; Nothing releases the form. Anything that is not a form leaves the
  /// previous one in place.
  /// @raises 13 if the value is not a form
  /// @family settings
  /// @see BrowseForFolder, SplashForm
  /// @example
  ///     On Error Resume Next
  ///     u.FolderBrowseForm = "frmFolder"
  ///     Print Err.Number & " " & Err.Description
  ///     ' 13 Type mismatch
  ObjectRef FolderBrowseForm;

  /// The date that the booking screen shows, kept for the host; the library does not use it. Before the first put it is
  /// 30/12/1899. A text that is put is read day first.
  /// @raises 13 if the value is not a date
  /// @family settings
  /// @example
  ///     u.BookingScreenDate = "5/3/2009"
  ///     Print u.VerifyNullDate(0, u.BookingScreenDate)
  ///     ' 05/03/2009
  Date BookingScreenDate;

  /// The form that the host shows while it starts, kept for the host; it can be set but not read. A form is any object
  /// with the property hwnd. Set it with Set; Nothing releases the form. Anything that is not a form leaves the
  /// previous one in place.
  /// @raises 13 if the value is not a form
  /// @family settings
  /// @see FolderBrowseForm
  /// @example
  ///     On Error Resume Next
  ///     u.SplashForm = 1
  ///     Print Err.Number & " " & Err.Description
  ///     ' 13 Type mismatch
  ObjectRef SplashForm;

  /// The picture box that MyDrawText draws on; it can be set but not read. A picture box is any object with ScaleMode
  /// and ScaleX; its scale must be twips. Set it with Set before the first MyDrawText, and to Nothing before its form
  /// is unloaded. Anything else leaves the previous one in place.
  /// @raises 13 if the value is not a picture box
  /// @family settings
  /// @see MyDrawText
  /// @example
  ///     On Error Resume Next
  ///     u.DrawTextPictureBox = "picJobs"
  ///     Print Err.Number & " " & Err.Description
  ///     ' 13 Type mismatch
  ObjectRef DrawTextPictureBox;

  /// The first number of the host's version, kept for the host. It is not the library's version.
  /// @family settings
  /// @see VersionMinor, VersionRevision
  /// @example
  ///     u.VersionMajor = 3
  ///     u.VersionMinor = 1
  ///     u.VersionRevision = 42
  ///     Print u.VersionMajor & "." & u.VersionMinor & "." & u.VersionRevision
  ///     ' 3.1.42
  std::int32_t VersionMajor = 0;

  /// The second number of the host's version, kept for the host.
  /// @family settings
  /// @see VersionMajor, VersionRevision
  /// @example
  ///     u.VersionMinor = 1
  ///     Print u.VersionMinor
  ///     ' 1
  std::int32_t VersionMinor = 0;

  /// The third number of the host's version, kept for the host.
  /// @family settings
  /// @see VersionMajor, VersionMinor
  /// @example
  ///     u.VersionRevision = 42
  ///     Print u.VersionRevision
  ///     ' 42
  std::int32_t VersionRevision = 0;

  /// A folder, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.sNatPath = "C:\ORV\NAT"
  ///     Print u.sNatPath
  ///     ' C:\ORV\NAT
  Text sNatPath;

  /// Whether a programmer is at work: exactly True (-1) makes SetupFileFolders show its errors in a message box. With
  /// any other value SetupFileFolders ends silently on an error.
  /// @family settings
  /// @see SetupFileFolders
  /// @example
  ///     u.bIsProgrammer = True
  ///     Print u.bIsProgrammer
  ///     ' True
  Boolean bIsProgrammer;

  /// Debugging of the host: exactly 1 makes Terminate show a message before it closes the components window. Every
  /// other value, True (-1) included, shows nothing.
  /// @family settings
  /// @see Terminate
  /// @example
  ///     u.DebugMode = 0
  ///     Print u.DebugMode
  ///     ' 0
  std::int16_t DebugMode = 0;

  /// A debug switch for job sheets, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.DebugJobSheet = 2
  ///     Print u.DebugJobSheet
  ///     ' 2
  std::int16_t DebugJobSheet = 0;

  /// Switches the event log on: with any value but 0, AppendEventLog writes; with 0 it does nothing.
  /// @family settings
  /// @see AppendEventLog, sORVPath, sUserName
  /// @example
  ///     u.sORVPath = folder
  ///     u.EventLog = 0
  ///     u.AppendEventLog "Start", "frmMain"
  ///     Print u.FileExists(folder & "\EventLog.txt")
  ///     ' False
  ///     u.EventLog = 1
  ///     u.AppendEventLog "Start", "frmMain"
  ///     Print u.FileExists(folder & "\EventLog.txt")
  ///     ' True
  std::int16_t EventLog = 0;

  /// The user's level of rights, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.UserLevel = 2
  ///     Print u.UserLevel
  ///     ' 2
  std::int16_t UserLevel = 0;

  /// Whether the host runs in New Zealand, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.bNewZealand = True
  ///     Print u.bNewZealand
  ///     ' True
  Boolean bNewZealand;

  /// The database's name, which is part of the groups in which the user's store keeps settings. With database Main and
  /// user anne they are "ORV3\Main_anne_UserSettings" and "ORV3\Main_DatabaseSettings". Set it with sUserName, before
  /// the first setting is read.
  /// @family settings
  /// @see sUserName, GetCfgFileData, SaveCfgFileData
  /// @example
  ///     u.sUserName = "anne"
  ///     u.sDatabaseName = "First"
  ///     u.SaveCfgFileData "Screen", "Colour", "red", "SCREEN.INI", False
  ///     u.sDatabaseName = "Second"
  ///     u.SaveCfgFileData "Screen", "Colour", "blue", "SCREEN.INI", False
  ///     u.sDatabaseName = "First"
  ///     Print u.GetCfgFileData("Screen", "Colour", "none", "SCREEN.INI", False)
  ///     ' red
  Text sDatabaseName;

  /// The computer's name, read when the library starts; it can be read but not set. It is read again when the
  /// components window loads after Terminate. On Linux it is the host's name.
  /// @family settings
  /// @see Terminate
  /// @example
  ///     Print Len(u.ComputerName) > 0
  ///     ' True
  Text ComputerName;

  /// The application's folder, without a backslash at its end: AppendEventLog writes to EventLog.txt there.
  /// @family settings
  /// @see AppendEventLog, EventLog
  /// @example
  ///     u.sORVPath = folder
  ///     u.EventLog = 1
  ///     u.AppendEventLog "Start", "frmMain"
  ///     Print u.FileExists(u.sORVPath & "\EventLog.txt")
  ///     ' True
  Text sORVPath;

  /// The folder of reports and exports, with a backslash at its end, as ExportGridData and SetupFileFolders expect it.
  /// SetupFileFolders creates it with its folders JobSheets and SummaryJobSheets, and changes it to
  /// C:\TAL\ORV3\Reports\ if it cannot be created. ExportGridData proposes a folder below it.
  /// @family settings
  /// @see ExportGridData, SetupFileFolders
  /// @example
  ///     u.sReportsDir = folder & "\Reports\"
  ///     u.sTemplatesDir = folder & "\Templates\"
  ///     u.SetupFileFolders
  ///     Print u.PathExists(folder & "\Reports\JobSheets")
  ///     ' True
  Text sReportsDir;

  /// The paper of grid reports: "A3" or "A4"; anything else leaves the paper of the previous report or of the printer.
  /// It is compared with regard to case: "a4" leaves the paper, too.
  /// @family settings
  /// @see GridPrintPreview, sGridPaperDuplex
  /// @example
  ///     u.sGridPaperSize = "A4"
  ///     Print u.sGridPaperSize
  ///     ' A4
  Text sGridPaperSize;

  /// The duplex mode of grid reports: "Horizontal", "Vertical" or "Simplex"; anything else leaves the mode as it is. It
  /// is compared with regard to case.
  /// @family settings
  /// @see GridPrintPreview, sGridPaperSize
  /// @example
  ///     u.sGridPaperDuplex = "Simplex"
  ///     Print u.sGridPaperDuplex
  ///     ' Simplex
  Text sGridPaperDuplex;

  /// The folder of pictures, with a backslash at its end; SetupFileFolders creates it. If it cannot be created,
  /// SetupFileFolders changes it to C:\TAL\ORV3\Pictures\ and creates that.
  /// @family settings
  /// @see SetupFileFolders
  /// @example
  ///     u.sPicturesDir = folder & "\Pictures\"
  ///     u.sTemplatesDir = folder & "\Templates\"
  ///     u.SetupFileFolders
  ///     Print u.PathExists(u.sPicturesDir)
  ///     ' True
  Text sPicturesDir;

  /// The folder of drawings, with a backslash at its end; SetupFileFolders creates it. If it cannot be created,
  /// SetupFileFolders changes it to C:\TAL\ORV3\Drawings\ and creates that.
  /// @family settings
  /// @see SetupFileFolders
  /// @example
  ///     u.sDrawingsDir = folder & "\Drawings\"
  ///     u.sTemplatesDir = folder & "\Templates\"
  ///     u.SetupFileFolders
  ///     Print u.PathExists(u.sDrawingsDir)
  ///     ' True
  Text sDrawingsDir;

  /// The folder of help files, with a backslash at its end; SetupFileFolders creates it. If it cannot be created,
  /// SetupFileFolders changes it to C:\TAL\ORV3\Help\ and creates that.
  /// @family settings
  /// @see SetupFileFolders
  /// @example A folder that cannot be created
  ///     u.sHelpDir = folder & "\a*b\"
  ///     u.sTemplatesDir = folder & "\Templates\"
  ///     u.SetupFileFolders
  ///     Print u.sHelpDir & "Index.hlp"
  ///     ' C:\TAL\ORV3\Help\Index.hlp
  Text sHelpDir;

  /// The folder of templates, with a backslash at its end; SetupFileFolders creates it and Letters below it. If it
  /// cannot be created, SetupFileFolders changes it to C:\TAL\ORV3\Templates\ and creates that.
  /// @family settings
  /// @see SetupFileFolders
  /// @example
  ///     u.sTemplatesDir = folder & "\Templates\"
  ///     u.SetupFileFolders
  ///     Print u.PathExists(folder & "\Templates\Letters")
  ///     ' True
  Text sTemplatesDir;

  /// A name, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.sNatNameA = "Jobs"
  ///     Print u.sNatNameA
  ///     ' Jobs
  Text sNatNameA;

  /// A name, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.sNatNameB = "Jobs"
  ///     Print u.sNatNameB
  ///     ' Jobs
  Text sNatNameB;

  /// The selector under which the library itself keeps settings: widths of grids, states of windows, control positions.
  /// It stands in the place of sFilename in GetCfgFileData and SaveCfgFileData, where it selects the user's group like
  /// any text that is not sORVDataName, "PreviousDatabaseSettings" or "CodeCount".
  /// @family settings
  /// @see LoadGridWidths, SaveGridWidths, LoadWindowState, SaveWindowState, GetControlPosition, SaveControlPosition
  /// @example
  ///     u.sDatabaseName = "Main"
  ///     u.sUserName = "anne"
  ///     u.sNatNameC = "ORV3WIN.INI"
  ///     Set g = CreateObject("TALUtil.Grid")
  ///     g.Cols = 1
  ///     g.ColWidth(0) = 2400
  ///     u.SaveGridWidths g, "Bookings", 0
  ///     Print u.GetCfgFileData("Bookings", "0ColWidth", "none", u.sNatNameC, False)
  ///     ' 2400
  Text sNatNameC;

  /// The selector of the user's own settings: GetCfgFileData with it as sFilename reads the group of sUserName. The
  /// name takes precedence over sORVDataName, "PreviousDatabaseSettings" and "CodeCount", should they be equal. Empty,
  /// it selects nothing.
  /// @family settings
  /// @see sORVDataName, sUserName, GetCfgFileData, SaveCfgFileData
  /// @example
  ///     u.sDatabaseName = "Main"
  ///     u.sUserName = "anne"
  ///     u.sNatNameD = "ORV3USER.INI"
  ///     u.SaveCfgFileData "Screen", "Colour", "red", u.sNatNameD, False
  ///     Print u.GetCfgFileData("Screen", "Colour", "none", u.sNatNameD, False)
  ///     ' red
  Text sNatNameD;

  /// A name, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.sNatNameE = "Jobs"
  ///     Print u.sNatNameE
  ///     ' Jobs
  Text sNatNameE;

  /// The selector of the settings that all users of a database share: with it as sFilename, GetCfgFileData reads them.
  /// Every write for a user also writes them, so they hold the last value that anybody saved.
  /// @family settings
  /// @see sNatNameD, sDatabaseName, GetCfgFileData, SaveCfgFileData
  /// @example
  ///     u.sDatabaseName = "Main"
  ///     u.sORVDataName = "ORV3DATA.INI"
  ///     u.sUserName = "anne"
  ///     u.SaveCfgFileData "Screen", "Colour", "red", "ORV3WIN.INI", False
  ///     u.sUserName = "bert"
  ///     Print u.GetCfgFileData("Screen", "Colour", "none", u.sORVDataName, False)
  ///     ' red
  Text sORVDataName;

  /// The user's name: part of the group of the user's settings, and of each event that AppendEventLog writes. While it
  /// is empty, settings are read from the database's group (except with "PreviousDatabaseSettings"), and written to the
  /// group "ORV3\Main__UserSettings", of a user without a name, as well.
  /// @family settings
  /// @see sDatabaseName, GetCfgFileData, SaveCfgFileData, AppendEventLog
  /// @example
  ///     u.sDatabaseName = "Main"
  ///     u.sUserName = "anne"
  ///     u.SaveCfgFileData "Screen", "Font", "Arial", "SCREEN.INI", False
  ///     u.sUserName = "bert"
  ///     u.SaveCfgFileData "Screen", "Font", "Courier", "SCREEN.INI", False
  ///     u.sUserName = "anne"
  ///     Print u.GetCfgFileData("Screen", "Font", "none", "SCREEN.INI", False)
  ///     ' Arial
  Text sUserName;

  /// A name, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.sAliasName = "Jobs"
  ///     Print u.sAliasName
  ///     ' Jobs
  Text sAliasName;

  /// The case in which ConvertCase writes names: 1 name case, 2 lower case, 3 upper case; else they stay unchanged. The
  /// rules of name case are on a page of their own.
  /// @family settings
  /// @see ConvertCase, iCharacterCaseSuburbs, docs/name-case.md
  /// @example
  ///     u.iCharactercase = 1
  ///     Print u.ConvertCase(0, "JOHN MCDONALD")
  ///     ' John McDonald
  ///     u.iCharactercase = 3
  ///     Print u.ConvertCase(0, "John McDonald")
  ///     ' JOHN MCDONALD
  std::int16_t iCharactercase = 0;

  /// The case in which ConvertCaseSuburbs writes suburbs: 1 name case, 3 upper case; else it returns them unchanged.
  /// @family settings
  /// @see ConvertCaseSuburbs, iCharactercase
  /// @example
  ///     u.iCharacterCaseSuburbs = 3
  ///     Print u.ConvertCaseSuburbs("North Ryde")
  ///     ' NORTH RYDE
  std::int16_t iCharacterCaseSuburbs = 0;

  /// Whether names of employees are converted, too, kept for the host; the library does not use it.
  /// @family settings
  /// @see iCharactercase
  /// @example
  ///     u.iCharacterCaseIncludeEmployees = 1
  ///     Print u.iCharacterCaseIncludeEmployees
  ///     ' 1
  std::int16_t iCharacterCaseIncludeEmployees = 0;

  /// The number of the user's branch, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.iBranchID = 4
  ///     Print u.iBranchID
  ///     ' 4
  std::int16_t iBranchID = 0;

  /// The number of the user's login session, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.lLoginSessionID = 70001
  ///     Print u.lLoginSessionID
  ///     ' 70001
  std::int32_t lLoginSessionID = 0;

  /// The first area that an employee works in, kept for the host; the library does not use it.
  /// @family settings
  /// @see EmployeeArea2
  /// @example
  ///     u.EmployeeArea1 = 12
  ///     Print u.EmployeeArea1
  ///     ' 12
  std::int32_t EmployeeArea1 = 0;

  /// The second area that an employee works in, kept for the host; the library does not use it.
  /// @family settings
  /// @see EmployeeArea1
  /// @example
  ///     u.EmployeeArea2 = 13
  ///     Print u.EmployeeArea2
  ///     ' 13
  std::int32_t EmployeeArea2 = 0;

  /// Whether the host writes a file of its server's performance, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.WriteServerPerformanceFile = True
  ///     Print u.WriteServerPerformanceFile
  ///     ' True
  Boolean WriteServerPerformanceFile;

  /// A switch, kept for the host; the library does not use it. It does not choose a cipher: CryptoEncryptString and
  /// CallZIPFiles encrypt the same way with any value.
  /// @family settings
  /// @example
  ///     u.bIsAES = True
  ///     Print u.bIsAES
  ///     ' True
  Boolean bIsAES;

  /// A switch, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.bPGMSMT = True
  ///     Print u.bPGMSMT
  ///     ' True
  Boolean bPGMSMT;

  /// The name of the host's server, kept for the host; the library does not use it.
  /// @family settings
  /// @example
  ///     u.sServerName = "SERVER1"
  ///     Print u.sServerName
  ///     ' SERVER1
  Text sServerName;

  /// The name of the host's configuration file, kept for the host; members take file names as arguments instead.
  /// @family settings
  /// @see GetCfgFileData, SaveCfgFileData
  /// @example
  ///     u.ORV3CFGName = folder & "\ORV3.INI"
  ///     u.SaveCfgFileData "Printer", "Name", "Office", u.ORV3CFGName, True
  ///     Print u.GetCfgFileData("Printer", "Name", "none", u.ORV3CFGName, True)
  ///     ' Office
  Text ORV3CFGName;

  // Not published: the screen's twips per pixel, set by the start-up routine.
  std::int32_t ScreenTwipsPerPixelX = 0;
  std::int32_t ScreenTwipsPerPixelY = 0;
};

}  // namespace talutil
