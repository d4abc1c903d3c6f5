' TALUtil from VBScript: cscript //nologo vbscript.vbs
Option Explicit
Dim u, list, count, week, i

Set u = CreateObject("TALUtil.ORVUtils")
WScript.Echo u.VerifyTextData(20, 1, "  Smith & Sons, Pty  ")
WScript.Echo u.IncMonth("31/1/2009", 1)

' A call can fill a variable: an array from 0, or a number that it corrects.
count = u.ReadCommaDelimStrToList("red,green,blue,", list)
For i = 0 To count - 1
  WScript.Echo i & " " & list(i)
Next
week = 60
u.WeekYearToDate week, 2009, 1
WScript.Echo "week " & week

' An array can be passed.
WScript.Echo u.IndexInList(Array("Apple", "Banana"), "ban")

' Errors have the usual numbers.
On Error Resume Next
u.GetWeekNumber "tomorrow"
If Err.Number <> 0 Then WScript.Echo "error " & Err.Number & ": " & Err.Description & " (" & Err.Source & ")"
On Error GoTo 0
u.Terminate
