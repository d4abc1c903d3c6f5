' What scripts see that neither the members' examples nor the guides show: the types of values, values of a script's own,
' and run-time errors by number, text and source. A script control runs this file too. Each check that fails is a line;
' the last line is "N passed, N failed".
'
'   cscript //nologo members.vbs
Option Explicit
Dim u, v, first, last, first_time, last_time, d, hours, passed, failed

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

Set u = CreateObject("TALUtil.ORVUtils")
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
Check "types", "IntegerLongBooleanSingleDateDateEmptyStringNull", TypeName(u.GetYear(0)) & _
  TypeName(u.MyPos("", "", 0)) & TypeName(u.VerifyEmail("")) & TypeName(u.ConvertDurationToNumber("1")) & _
  TypeName(u.VerifyNullDate(0, Empty)) & TypeName(u.BookingScreenDate) & TypeName(u.WeekYearToDate(1, 2009, 7)) & _
  TypeName(u.AddZeros(7, 3, 1)) & TypeName(u.ConvertCase(0, Null))
Check "values", "12.5u0", u.VerifyTextData(0, 0, 12.5) & _
  u.VerifyTextData(0, 0, New ValueHolder) & u.VerifyIntData(0, Empty)

On Error Resume Next
v = u.IncWeek("5/3/2009", 4682) : CheckError "overflow", "6 Overflow"
v = u.CryptoDecryptString("QUJD")
CheckError "no cipher text", "5 This is not a cipher text of this library, or it was changed"
Set u.DrawTextPictureBox = CreateObject("Scripting.Dictionary")
CheckError "a dictionary to draw on", "13 Type mismatch"
u.LoadWindowState CreateObject("TALUtil.Grid"), "Members"
CheckError "no form", "438 Object doesn't support this property or method"
u.ComputerName = "x" : CheckHostError "a put on ComputerName", "438 Object doesn't support this property or method"
u.NoSuchMember : CheckHostError "an unknown member", "438 Object doesn't support this property or method"
v = u.VerifyTextData(0, 0, Nothing) : CheckError "Nothing", "91 Object variable or With block variable not set"
v = u.VerifyTextData(Null, 0, "a") : CheckError "Null for a number", "94 Invalid use of Null"
v = u.StripNulls() : Check "no argument", 449, Err.Number And 65535 : Err.Clear
v = u.StripNulls("a", "b")
CheckHostError "two arguments", "450 Wrong number of arguments or invalid property assignment"
u.Terminate
WScript.Echo passed & " passed, " & (0 + failed) & " failed"
