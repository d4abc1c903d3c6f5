' A script as hosts write them: late binding, script variables written back, run-time errors by number and text.
' The last line is the counts; a script that dies prints none, for it ends without a word and with exit code 0.
Option Explicit

Dim u, v, passed, failed
passed = 0
failed = 0

Sub Check(name, expected, got)
  Dim same
  same = False
  If VarType(expected) = VarType(got) Then same = (expected = got)
  If same Then
    passed = passed + 1
  Else
    failed = failed + 1
    WScript.Echo "FAILED members.vbs, " & name & ": expected " & TypeName(expected) & " """ & expected & _
      """, got " & TypeName(got) & " """ & got & """"
  End If
End Sub

' To be called while On Error Resume Next is in force, right after the statement that should fail.
Sub CheckError(name, number, description)
  Check name & ", number", CLng(number), CLng(Err.Number)
  Check name & ", description", description, Err.Description
  Err.Clear
End Sub

Sub Settings
  Dim other
  u.sUserName = "anne"
  Set other = CreateObject("TALUtil.ORVUtils")
  Check "a setting through another object", "anne", other.sUserName
  Set other = Nothing
  Check "WriteServerPerformanceFile before any put", False, u.WriteServerPerformanceFile
  u.bIsProgrammer = True
  Check "a Boolean", True, u.bIsProgrammer
  u.BookingScreenDate = DateSerial(2009, 7, 1)
  Check "a date", DateSerial(2009, 7, 1), u.BookingScreenDate
  Set u.FolderBrowseForm = Nothing
End Sub

Sub Texts
  Check "a number as text", "12.5", u.VerifyTextData(0, 0, 12.5)
  Check "an object for its value", "u", u.VerifyTextData(0, 0, New ValueHolder)
  Check "Empty", "0", u.VerifyIntData(0, Empty)
  Check "a memo", "A" & vbCr & " B", u.VerifyMemField("A" & vbCrLf & "B")
  Check "StripNulls", "ab", u.StripNulls("ab" & Chr(0) & "cd")
  Check "RemoveNumberFromString", "abC", u.RemoveNumberFromString("a1 b@,C")
  Check "StringReplace", "a--b--", u.StringReplace("a;b;", ";x", "--")
  Check "MyPos", 1, CInt(u.MyPos(",", "A,B", 0))
  Check "SubStrCount", 2, CInt(u.SubStrCount("a", "aAa"))
  Check "CRLFStringReplace", "AxxB", u.CRLFStringReplace("A" & vbCrLf & "B", "x")
  Check "StringRestoreCRLF", "A" & vbCrLf & "B", u.StringRestoreCRLF("AxxB", "x")
  Check "AddZeros", "700", u.AddZeros(7, 3, 1)
  Check "ReverseString", "cba", u.ReverseString("abc")
  Check "StringPosition", 3, u.StringPosition("12 SMITH ST", 1)
  Check "MyInstrDelim", True, u.MyInstrDelim("B", "A,B,", ",")
  Check "StringReplaceWord", "a-c-", u.StringReplaceWord("aBBcBB", "BB", "-")
  Check "IsValueNumber", True, u.IsValueNumber("1.2.3")
  Check "IsValueDate", True, u.IsValueDate("15-11-2024")
  Check "IsValueTime", False, u.IsValueTime("09:30:00")
  Check "VerifyEmail", True, u.VerifyEmail("x@y.z")
  Check "VerifyPasswordText", False, u.VerifyPasswordText("abc")
  Check "NumbersInString", True, u.NumbersInString("Unit 4")
  u.iCharactercase = 1
  u.iCharacterCaseSuburbs = 2
  Check "a style that suburbs do not have", "st ives", u.ConvertCaseSuburbs("st ives")
  Check "Null stays", True, IsNull(u.ConvertCase(0, Null))
  u.iCharactercase = 0
  Check "length of a password", 40, CInt(Len(u.GenerateFilePassword(40, 2, 1)))
  Check "there and back", "a" & vbCrLf & Chr(0) & Chr(233), u.CryptoDecryptString(u.CryptoEncryptString("a" & vbCrLf & Chr(0) & Chr(233)))
End Sub

Sub Configuration
  Dim files, ini, output
  Set files = CreateObject("Scripting.FileSystemObject")
  ini = files.GetSpecialFolder(2) & "\talutil-members.ini"
  If files.FileExists(ini) Then files.DeleteFile ini
  u.sDatabaseName = "Members"
  u.sUserName = "anne"
  output = "\\server\share"
  u.SaveCfgFileData "S", "unc", output, ini, True
  Check "never comes back", "d", u.GetCfgFileData("S", "unc", "d", ini, True)
  output = String(3000, "x") & vbCrLf & Chr(0) & "y"
  u.SaveCfgFileData "A\B", "k=", output, "any"
  Check "a long value of the store", output, u.GetCfgFileData("a\b", "K=", "d", "any")
  files.DeleteFile ini
End Sub

Sub Files
  Dim files, folder, list, path, text
  Set files = CreateObject("Scripting.FileSystemObject")
  folder = files.GetSpecialFolder(2) & "\talutil-members\"
  path = folder & "One\"
  u.VerifyFilePath path & "not a folder"
  Check "folders are made", True, u.PathExists(path)
  u.SaveTextBox "O" & Chr(180) & "Brien", path & "a.txt"
  Check "a file, in quotes", True, u.FileExists("""" & path & "A.TXT""")
  Check "text and line end", "O" & Chr(180) & "Brien" & vbCrLf, u.LoadTextBox(path & "a.txt")
  list = Array("first", "", "last")
  u.SaveBigFile list, path & "b.txt"
  Check "lines", 3, CInt(u.OpenFile(path & "b.txt", list, 0))
  Check "lines without blank ones", 2, CInt(u.OpenBigFile(path & "b.txt", list, 1))
  Check "a line", "last", list(1)
  u.CopyFileToBackupFile path & "b.txt", path & "b.bak"
  Check "a copy", u.LoadTextBox(path & "b.txt"), u.LoadTextBox(path & "b.bak")
  Check "GetFileCount", 3, CInt(u.GetFileCount(path, ""))
  text = """C:\dir\file.tar.gz"""
  Check "ExtractFilename", "file.tar.gz", u.ExtractFilename(text)
  Check "quotes are gone", "C:\dir\file.tar.gz", text
  Check "ExtractPathName", "C:\dir\", u.ExtractPathName(text)
  u.DeleteFiles path & "*.txt"
  u.DeleteFiles path & "*.txt"
  Check "what is left", "b.bak", u.GetFileList(",", path, "")
  Check "a GUID", 38, CInt(Len(u.GetNewGuid))
  u.sReportsDir = "Q:\Reports\"
  u.SetupFileFolders
  Check "a fall-back", "C:\TAL\ORV3\Reports\", u.sReportsDir
  Check "a standard folder", True, u.PathExists("C:\TAL\ORV3\Reports\SummaryJobSheets\Processed")
  files.DeleteFolder Left(folder, Len(folder) - 1)
End Sub

Sub WriteBack
  Dim number, list
  number = 5
  Check "a number to remove", "A ", u.RemoveStringsFromNumber(2, "A 5", number)
  Check "an unchanged variable keeps its type", 5, number
  Check "elements with another delimiter", 3, CInt(u.ReadCommaDelimStrToList("A;;B;", list, ";"))
  Check "an empty element", "", list(1)
  Check "IndexInList in a list read before", 2, CInt(u.IndexInList(list, "b"))
End Sub

Sub Dates
  Dim d, epoch
  epoch = DateSerial(1800, 1, 1)
  Check "GetYear", 2009, u.GetYear("5/3/2009")
  Check "GetMonth of a date", 3, u.GetMonth(DateSerial(2009, 3, 5))
  Check "GetDay of Null", 1, u.GetDay(Null)
  Check "GetDaysThisMonth", 29, u.GetDaysThisMonth(2, 2008)
  Check "SetDayOfMonth", "31/2/2009", u.SetDayOfMonth("5/2/2009", 31)
  Check "GetFinancialYearStr", "0910", u.GetFinancialYearStr("15/08/2009")
  Check "VerifyNullTime", "14:05", u.VerifyNullTime(0, TimeSerial(14, 5, 59))
  Check "VerifyNullDate of nothing", DateSerial(1980, 1, 1), u.VerifyNullDate(0, Empty)
  Check "GetDateFromString", "29/02/2008", u.GetDateFromString("29022008")
  Check "WeekYearToDate of no option", Empty, u.WeekYearToDate(1, 2009, 7)
  Check "GetWeekInDateRange", False, u.GetWeekInDateRange("1/3/2009", "7/1/2009", 1, 2009)
  Check "IncDay", "29/02/2008", u.IncDay("1/3/2008", -1)
  Check "IncWeek", "03/03/2008", u.IncWeek("25/2/2008", 1)
  Check "IncYear", "28/02/2009", u.IncYear("29/2/2008", 1)
  Check "GetNextDate", "30/06/2009", u.GetNextDate("31/3/2009", "Monthly", "3")
  Check "AddTimeToDate", "05/03/2009 09:05", u.AddTimeToDate("5/3/2009 17:00", "9:05")
  d = TimeSerial(1, 30, 0)
  Check "a bare time", "1:30", u.DateTimeToDuration(d)
  Check "comes back with its day", "1/1/1800 01:30", d
  Check "DurationToDateTime", epoch - 1.5 / 24, u.DurationToDateTime("1:30")
  Check "ConvertDatabaseDurationToNumber", "0.25", u.ConvertDatabaseDurationToNumber("1/1/1800 0:15")
  Check "ConvertNumberToDatabaseDuration", epoch - 1.5 / 24, u.ConvertNumberToDatabaseDuration(90)
  Check "ConvertTimeToMinutes", 825, CInt(u.ConvertTimeToMinutes("13:45"))
  Check "GetDaysInPeriod", 4, CInt(u.GetDaysInPeriod("5/3/2024", "1/3/2024"))
  Check "GetMonthsInPeriod", -1, CInt(u.GetMonthsInPeriod("5/3/2024", "5/3/2024"))
End Sub

Sub Tables
  Dim grid, zip
  Set grid = CreateObject("TALUtil.Grid")
  grid.Cols = 2
  grid.AddItem "Job" & vbTab & "Done"
  grid.FixedRows = 1
  grid.AddItem "1001"
  grid.AddItem "1002" & vbTab & "True"
  grid.ColDataType(1) = 11
  grid.TextMatrix(1, 0) = "a,b"
  Check "a cell", "a,b", grid.TextMatrix(1, 0)
  u.SelectGridRows 1, grid, 1
  Check "all ticks", CLng(2), u.CountGridSelectedRows(1, grid)
  Set zip = CreateObject("TALUtil.ZipControl")
  Check "the level of the zip control", CLng(6), zip.CompressionLevel
  Check "pages", CLng(4), u.GetMaxPages(4, 14)
  Check "inside", True, u.GetMousePos(5, 5, 1, 1, 9, 9)
  On Error Resume Next
  grid.TextMatrix(9, 0) = "x"
  Check "no such row", CLng(9), CLng(Err.Number)
  Err.Clear
  u.LoadWindowState grid, "Members"
  CheckError "no form", 438, "Object doesn't support this property or method"
End Sub

Sub Errors
  Dim form
  On Error Resume Next
  Set u.DrawTextPictureBox = CreateObject("Scripting.Dictionary")
  CheckError "a dictionary for a picture box", 13, "Type mismatch"
  u.ComputerName = "x"
  CheckError "a put on ComputerName", 438, "Object doesn't support this property or method"
  Set form = u.SplashForm
  CheckError "a get of SplashForm", 438, "Object doesn't support this property or method"
  u.NoSuchMember
  CheckError "an unknown member", 438, "Object doesn't support this property or method"
  v = u.VerifyTextData(0, 0, Nothing)
  CheckError "Nothing", 91, "Object variable or With block variable not set"
  v = u.VerifyTextData(Null, 0, "a")
  CheckError "Null for a number", 94, "Invalid use of Null"
  v = u.IndexInList("no list", "a")
  CheckError "a text for a list", 13, "Type mismatch"
  v = u.StripNulls()
  ' The script host words this one itself.
  Check "no argument", CLng(449), CLng(Err.Number)
  Err.Clear
  v = u.StripNulls("a", "b")
  CheckError "two arguments", 450, "Wrong number of arguments or invalid property assignment"
  u.SaveTextBox "x", "Q:\a.txt"
  CheckError "a missing drive", 76, "Path not found"
  v = u.SetDayOfMonth(Null, 1)
  CheckError "Null for a date", 94, "Invalid use of Null"
  u.SystemTimeToDate Null, v
  CheckError "no record", 13, "Type mismatch"
End Sub

Class ValueHolder
  Public Default Property Get Value
    Value = "u"
  End Property
End Class

Set u = CreateObject("TALUtil.ORVUtils")
Settings
Texts
Configuration
Tables
Files
WriteBack
Dates
Errors
u.Terminate
WScript.Echo passed & " passed, " & failed & " failed"
