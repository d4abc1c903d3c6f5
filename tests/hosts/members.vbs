' What scripts do with the members and neither the members' examples nor the guides show, or only to cscript: variables
' that are written back, types, values of a script's own, and run-time errors by number, text and source. A script
' control runs this file too. Each check that fails is a line; the last line is "N passed, N failed".
'
'   cscript //nologo members.vbs
Option Explicit
Dim u, v, folder, list, character, missing, week, first, last, first_time, last_time, hours, ini, output, other, d
Dim grid, zip, passed, failed

Sub Check(name, expected, actual)
  If "" & expected = "" & actual Then
    passed = passed + 1
  Else
    failed = failed + 1
    WScript.Echo "FAILED " & name & ": expected " & expected & ", got " & actual
  End If
End Sub

' For errors that the script host words itself.
Sub CheckHostError(name, expected)
  Check name, expected, (Err.Number And 65535) & " " & Err.Description
  Err.Clear
End Sub

Sub CheckError(name, expected)
  Check name & ", its source", "TALUtil.ORVUtils", Err.Source
  CheckHostError name, expected
End Sub

Class ValueHolder
  Public Default Property Get Value
    Value = "u"
  End Property
End Class

folder = "C:\clients\"
Set u = CreateObject("TALUtil.ORVUtils")
Call u.VerifyFilePath(folder)

Check "a list", "3 red/green/blue", u.ReadCommaDelimStrToList("red,green,blue,", list) & " " & list(0) & "/" & _
  list(1) & "/" & list(2)
Check "a list of the script's own", 1, u.IndexInList(Array("Apple", "Banana"), "ban")
Check "a text", "AB[ ]", u.RemoveStringsFromNumber(2, "A B", character) & "[" & character & "]"
Check "an acute accent", 180, Asc(Mid(u.VerifyTextData(0, 0, "O'Brien"), 2, 1))
missing = "00:00:00"
Check "a date", "1980 01/01/1980", Year(u.VerifyNullDate(0, missing)) & " " & missing
week = 60
Check "a week", "12 52", Month(u.WeekYearToDate(week, 2009, 1)) & " " & week
first = DateSerial(2024, 3, 10)
last = DateSerial(2024, 3, 11)
first_time = TimeSerial(22, 0, 0)
last_time = TimeSerial(2, 0, 0)
Check "a difference", "4:0", u.GetTimeDifference(first, last, first_time, last_time)
Check "its dates", "10/03/2024 11/03/2024 22:00 02:00", first & " " & last & " " & first_time & " " & last_time
d = DateSerial(2024, 3, 11)
Check "UTC and back", True, u.UTCToLocalTime(u.LocalTimeToUTC(d)) = d
hours = " 1.5 "
Check "a duration", "90 [1.5]", u.ConvertDatabaseDurationToMinutes(u.DurToTime(hours)) & " [" & hours & "]"
d = TimeSerial(1, 30, 0)
Check "a time as a duration", "1:30 of 1/1/1800 01:30", u.DateTimeToDuration(d) & " of " & d
output = "\\server\share"
ini = folder & "client.ini"
Call u.SaveCfgFileData("Branch", "Path", output, ini, True)
Check "a setting", "\ none", output & " " & u.GetCfgFileData("branch", "path", "none", ini, True)
Call u.SaveBigFile(Array("first", "", "last"), folder & "b.txt")
Check "lines", "32last", u.OpenFile(folder & "b.txt", list, 0) & u.OpenBigFile(folder & "b.txt", list, 1) & list(1)

u.sUserName = "anne"
Set other = CreateObject("TALUtil.ORVUtils")
Check "another object", "anne False", other.sUserName & " " & other.WriteServerPerformanceFile
Set u.FolderBrowseForm = Nothing
u.BookingScreenDate = DateSerial(2009, 7, 1)
Check "a date as a property", DateSerial(2009, 7, 1), u.BookingScreenDate
Check "types", "IntegerLongBooleanSingleDateDateEmptyStringNull", TypeName(u.GetYear(0)) & _
  TypeName(u.MyPos("", "", 0)) & TypeName(u.VerifyEmail("")) & TypeName(u.ConvertDurationToNumber("1")) & _
  TypeName(u.VerifyNullDate(0, Empty)) & TypeName(u.BookingScreenDate) & TypeName(u.WeekYearToDate(1, 2009, 7)) & _
  TypeName(u.AddZeros(7, 3, 1)) & TypeName(u.ConvertCase(0, Null))
Check "values", "12.5u0", u.VerifyTextData(0, 0, 12.5) & _
  u.VerifyTextData(0, 0, New ValueHolder) & u.VerifyIntData(0, Empty)
Check "identifiers", "38 True", Len(u.GetNewGuid) & " " & (u.GetNewGuid <> u.GetNewGuid)
Set grid = CreateObject("TALUtil.Grid")
grid.Rows = 1
grid.Cols = 1
grid.TextMatrix(0, 0) = "a,b"
Set zip = CreateObject("TALUtil.ZipControl")
Check "controls", "a,b 6", grid.TextMatrix(0, 0) & " " & zip.CompressionLevel

On Error Resume Next
v = u.IncWeek("5/3/2009", 4682) : CheckError "overflow", "6 Overflow"
u.DrawTextPictureBox = "a text" : CheckError "no object", "13 Type mismatch"
Set u.DrawTextPictureBox = CreateObject("Scripting.Dictionary")
CheckError "a dictionary to draw on", "13 Type mismatch"
v = u.CryptoDecryptString("QUJD")
CheckError "no cipher text", "5 This is not a cipher text of this library, or it was changed"
grid.TextMatrix(9, 0) = "x" : Check "no such row", 9, Err.Number And 65535 : Err.Clear
u.LoadWindowState grid, "Members" : CheckError "no form", "438 Object doesn't support this property or method"
u.ComputerName = "x" : CheckHostError "a put on ComputerName", "438 Object doesn't support this property or method"
Set v = u.SplashForm : CheckHostError "a get of SplashForm", "438 Object doesn't support this property or method"
u.NoSuchMember : CheckHostError "an unknown member", "438 Object doesn't support this property or method"
v = u.VerifyTextData(0, 0, Nothing) : CheckError "Nothing", "91 Object variable or With block variable not set"
v = u.VerifyTextData(Null, 0, "a") : CheckError "Null for a number", "94 Invalid use of Null"
v = u.IndexInList("no list", "a") : CheckError "a text for a list", "13 Type mismatch"
v = u.StripNulls() : Check "no argument", 449, Err.Number And 65535 : Err.Clear
v = u.StripNulls("a", "b")
CheckHostError "two arguments", "450 Wrong number of arguments or invalid property assignment"
u.SaveTextBox "x", "Q:\a.txt" : CheckError "a missing drive", "76 Path not found"
u.SystemTimeToDate Null, v : CheckError "no record", "13 Type mismatch"
u.Terminate
WScript.Echo passed & " passed, " & (0 + failed) & " failed"
