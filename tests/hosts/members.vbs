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
  u.iBranchID = 12
  Check "a 16-bit integer", 12, u.iBranchID
  u.lLoginSessionID = 70000
  Check "a 32-bit integer", 70000, u.lLoginSessionID
  u.GSTValue = 12.5
  Check "a single", CSng(12.5), u.GSTValue
  u.BookingScreenDate = DateSerial(2009, 7, 1)
  Check "a date", DateSerial(2009, 7, 1), u.BookingScreenDate
  Set u.FolderBrowseForm = u
  Set u.FolderBrowseForm = Nothing
End Sub

Sub SettingErrors
  On Error Resume Next
  u.DrawTextPictureBox = "a text"
  CheckError "a text for a picture box", 13, "Type mismatch"
  u.iBranchID = 40000
  CheckError "a number of 17 bits", 6, "Overflow"
  u.ComputerName = "x"
  CheckError "a put on ComputerName", 438, "Object doesn't support this property or method"
  Check "ComputerName is known", True, Len(u.ComputerName) > 0
  Dim form
  Set form = u.SplashForm
  CheckError "a get of SplashForm", 438, "Object doesn't support this property or method"
  u.NoSuchMember
  CheckError "an unknown member", 438, "Object doesn't support this property or method"
End Sub

Sub Sanitising
  Dim lines
  u.CounterVerifyText = 0
  Check "Null", "", u.VerifyTextData(0, 0, Null)
  Check "CounterVerifyText", 1, CInt(u.CounterVerifyText)
  Check "trim, ampersand, apostrophe, cut", "O" & Chr(180) & "Brien an", u.VerifyTextData(10, 0, "  O'Brien & Sons  ")
  Check "commas and blanks", "123", u.VerifyTextData(0, 3, "1, 2 ,3")
  Check "characters that go", "abc", u.VerifyTextData(0, 0, "a" & Chr(34) & "#b" & vbTab & "<>?c")
  lines = "A" & vbCrLf & "x $*$ y" & vbCrLf & " B "
  Check "marked lines", "A" & vbCrLf & "B" & vbCrLf, u.VerifyTextData(0, 5, lines)
  Check "short lines join", "Unit 5 - Main Rd" & vbCrLf, u.VerifyTextData(0, 4, "Unit 5" & vbCrLf & "Main Rd")
  lines = String(40, "a") & vbCrLf & String(40, "b") & vbCrLf & String(40, "c") & vbCrLf & String(40, "d")
  Check "the last three lines", Mid(lines, 43) & vbCrLf, u.VerifyTextData(0, 4, lines)
  Check "a number as text", "12.5", u.VerifyTextData(0, 0, 12.5)
  Check "an object for its value", "u", u.VerifyTextData(0, 0, New ValueHolder)
  Check "Null with flag 1", "0", u.VerifyIntData(1, Null)
  Check "Null with flag 0", "", u.VerifyIntData(0, Null)
  Check "Empty", "0", u.VerifyIntData(0, Empty)
  Check "a leading number", "3.5", u.VerifyIntData(0, "3.50kg")
  Check "no thousands", "1", u.VerifyIntData(0, "1,000")
  Check "blanks within", "45", u.VerifyIntData(0, " 4 5")
  Check "hexadecimal", "255", u.VerifyIntData(0, "&HFF")
  Check "a memo", "A" & vbCr & " B", u.VerifyMemField("A" & vbCrLf & "B")
  Check "four blanks", "a  b", u.VerifyMemField("a    b")
End Sub

Sub SanitisingErrors
  On Error Resume Next
  u.CounterVerifyText = 2147483647
  v = u.VerifyTextData(0, 0, "a")
  CheckError "CounterVerifyText at its maximum", 6, "Overflow"
  u.CounterVerifyText = 0
  v = u.VerifyTextData(0, 0, Nothing)
  CheckError "Nothing", 91, "Object variable or With block variable not set"
  v = u.VerifyIntData(0, "1E999")
  CheckError "beyond a double", 6, "Overflow"
  v = u.VerifyTextData(Null, 0, "a")
  CheckError "Null for a number", 94, "Invalid use of Null"
End Sub

Sub Toolkit
  Check "StripNulls", "ab", u.StripNulls("ab" & Chr(0) & "cd")
  Check "RemoveNumberFromString", "abC", u.RemoveNumberFromString("a1 b@,C")
  Check "digits", "12", u.RemoveStringsFromNumber(0, "a1 2.", "")
  Check "digits and blanks", "1 2", u.RemoveStringsFromNumber(1, "a1 2.", "")
  Check "StringReplace", "a--b--", u.StringReplace("a;b;", ";x", "--")
  Check "second field", "B", u.GetData("A,B,C,", 1, 2)
  Check "no third comma", "", u.GetData("A,B,C", 2, 3)
  Check "count 0", 1, CInt(u.MyPos(",", "A,B", 0))
  Check "SubStrCount", 2, CInt(u.SubStrCount("a", "aAa"))
  Check "CRLFStringReplace", "AxxB", u.CRLFStringReplace("A" & vbCrLf & "B", "x")
  Check "StringRestoreCRLF", "A" & vbCrLf & "B", u.StringRestoreCRLF("AxxB", "x")
  Check "marker at the end", "AB" & vbCrLf & "x", u.StringRestoreCRLF("ABx", "x")
  Check "zeros before", "007", u.AddZeros("7", 3, -1)
  Check "zeros after", "700", u.AddZeros(7, 3, 1)
  Check "zeros nowhere", "7", u.AddZeros("7", 3, 0)
  Check "ReverseString", "cba", u.ReverseString("abc")
  Check "StringPosition", 3, u.StringPosition("12 SMITH ST", 1)
  Check "StringPosition with a unit", 10, u.StringPosition("UNIT 4 12 SMITH", 1)
  Check "an open last field", False, u.MyInstrDelim("B", "A,B", ",")
  Check "a closed last field", True, u.MyInstrDelim("B", "A,B,", ",")
  Check "StringReplaceWord", "a-c-", u.StringReplaceWord("aBBcBB", "BB", "-")
End Sub

Sub ToolkitErrors
  On Error Resume Next
  v = u.StringReplace("a", "", "b")
  CheckError "no character to replace", 5, "Invalid procedure call or argument"
  v = u.GetData("A,B,", 2, 1)
  CheckError "fields backwards", 5, "Invalid procedure call or argument"
  v = u.ReverseString(String(32768, "x"))
  CheckError "32768 characters", 6, "Overflow"
  v = u.IndexInList("no list", "a")
  CheckError "a text for a list", 13, "Type mismatch"
  v = u.StripNulls()
  ' The script host words this one itself.
  Check "no argument", CLng(449), CLng(Err.Number)
  Err.Clear
  v = u.StripNulls("a", "b")
  CheckError "two arguments", 450, "Wrong number of arguments or invalid property assignment"
  u.ShowSysInfo
  CheckError "a member to come", 445, "Object doesn't support this action"
End Sub

Sub Files
  Dim files, folder, list, path, text
  Set files = CreateObject("Scripting.FileSystemObject")
  folder = files.GetSpecialFolder(2) & "\talutil-members\"
  path = folder & "One\"
  u.VerifyFilePath path & "not a folder"
  Check "folders are made", True, u.PathExists(path)
  Check "a folder is no file", False, u.FileExists(folder & "One")
  u.SaveTextBox "O" & Chr(180) & "Brien", path & "a.txt"
  Check "a file, in quotes", True, u.FileExists("""" & path & "A.TXT""")
  Check "text and line end", "O" & Chr(180) & "Brien" & vbCrLf, u.LoadTextBox(path & "a.txt")
  list = Array("first", "", "last")
  u.SaveBigFile list, path & "b.txt"
  Check "lines", 3, CInt(u.OpenFile(path & "b.txt", list, 0))
  Check "lines up to a limit", 2, CInt(u.OpenFile(path & "b.txt", list, 2))
  Check "their array", 1, CInt(UBound(list))
  Check "lines without blank ones", 2, CInt(u.OpenBigFile(path & "b.txt", list, 1))
  Check "a line", "last", list(1)
  u.CopyFileToBackupFile path & "b.txt", path & "b.bak"
  Check "a copy", u.LoadTextBox(path & "b.txt"), u.LoadTextBox(path & "b.bak")
  Check "GetFileCount", 3, CInt(u.GetFileCount(path, ""))
  Check "GetFileList", "b.bak", u.GetFileList(",", path, "*.bak")
  text = """C:\dir\file.tar.gz"""
  Check "ExtractFilename", "file.tar.gz", u.ExtractFilename(text)
  Check "quotes are gone", "C:\dir\file.tar.gz", text
  Check "without extensions", "file", u.ExtractFilename(text, False)
  Check "ExtractPathName", "C:\dir\", u.ExtractPathName(text)
  u.DeleteFiles path & "*.txt"
  u.DeleteFiles path & "*.txt"
  Check "what is left", "b.bak", u.GetFileList(",", path, "")
  u.sORVPath = folder
  u.sUserName = "anne"
  u.EventLog = 1
  u.AppendEventLog "Booking saved", "frmBooking"
  text = u.LoadTextBox(folder & "EventLog.txt")
  Check "an event", "anne:Booking saved:frmBooking" & vbCrLf, Left(text, 5) & Mid(text, 21)
  Check "a GUID", 38, CInt(Len(u.GetNewGuid))
  u.sReportsDir = "Q:\Reports\"
  u.SetupFileFolders
  Check "a fall-back", "C:\TAL\ORV3\Reports\", u.sReportsDir
  Check "a standard folder", True, u.PathExists("C:\TAL\ORV3\Reports\SummaryJobSheets\Processed")
  files.DeleteFolder Left(folder, Len(folder) - 1)
End Sub

Sub FileErrors
  On Error Resume Next
  u.SaveTextBox "x", "Q:\a.txt"
  CheckError "a missing drive", 76, "Path not found"
  u.SaveTextBox "x", "C:\"
  CheckError "a folder for a file", 75, "Path/File access error"
  u.SaveTextBox "x", "C:\nul.txt"
  CheckError "a device", 52, "Bad file name or number"
End Sub

Sub WriteBack
  Dim character, number, list, names(1)
  character = ""
  Check "blanks go", "AB", u.RemoveStringsFromNumber(2, "A B", character)
  Check "the blank comes back", " ", character
  number = 5
  Check "a number to remove", "A ", u.RemoveStringsFromNumber(2, "A 5", number)
  Check "an unchanged variable keeps its type", 5, number
  Check "elements", 2, CInt(u.ReadCommaDelimStrToList("A,B,C", list))
  Check "the last index", 1, CInt(UBound(list))
  Check "an element", "B", list(1)
  Check "elements with another delimiter", 3, CInt(u.ReadCommaDelimStrToList("A;;B;", list, ";"))
  Check "an empty element", "", list(1)
  Check "no delimiter", 0, CInt(u.ReadCommaDelimStrToList("A", list))
  Check "the list stays", 2, CInt(UBound(list))
  names(0) = "Apple"
  names(1) = "Banana"
  Check "IndexInList", 1, CInt(u.IndexInList(names, "ban"))
  Check "IndexInList in a list read before", 2, CInt(u.IndexInList(list, "b"))
  Check "no such entry", -1, CInt(u.IndexInList(names, "cherry"))
End Sub

Class ValueHolder
  Public Default Property Get Value
    Value = "u"
  End Property
End Class

Set u = CreateObject("TALUtil.ORVUtils")
Settings
SettingErrors
Sanitising
SanitisingErrors
Toolkit
ToolkitErrors
Files
FileErrors
WriteBack
u.Terminate
WScript.Echo passed & " passed, " & failed & " failed"
