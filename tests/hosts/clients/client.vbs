' Work as a script does it, bound late: each line printed is NAME=VALUE, which expected.txt compares.
'
'   cscript //nologo client.vbs CLIENT
'
' CLIENT keeps the files and settings of one run apart from those of others. script_control.vbs runs this file too.
Option Explicit

Dim u, client, folder
client = WScript.Arguments(WScript.Arguments.Count - 1)
folder = "C:\clients\" & client & "\"

Sub Say(name, value)
  WScript.Echo name & "=" & value
End Sub

Sub Texts
  Say "text", u.VerifyTextData(20, 1, "  Smith & ""Sons"", Pty #1  ")
  Say "text.apostrophe", Asc(Mid(u.VerifyTextData(0, 0, "O'Brien"), 2, 1))
  Say "number", u.VerifyIntData(0, "3.50kg")
  Say "number.null", u.VerifyIntData(1, Null)
  u.iCharactercase = 1
  Say "case", u.ConvertCase(0, "MARY SMITH-JONES")
End Sub

Sub Lists
  Dim list, names(1), character
  Say "list", u.ReadCommaDelimStrToList("red,green,blue,", list)
  Say "list.items", list(0) & "/" & list(1) & "/" & list(2)
  names(0) = "Apple"
  names(1) = "Banana"
  Say "list.index", u.IndexInList(names, "ban")
  Say "field", u.GetData("A,B,C,", 1, 2)
  character = ""
  Say "blanks", u.RemoveStringsFromNumber(2, "A B", character)
  Say "blanks.back", "[" & character & "]"
End Sub

Sub Dates
  Dim first, last, first_time, last_time, missing, week
  missing = "00:00:00"
  Say "date", Year(u.VerifyNullDate(0, missing))
  Say "date.back", missing
  Say "month", u.IncMonth(DateSerial(2009, 1, 31), 1)
  Say "week", u.GetWeekNumber(DateSerial(2009, 12, 31))
  week = 60
  Say "week.start", Month(u.WeekYearToDate(week, 2009, 1))
  Say "week.back", week
  first = DateSerial(2024, 3, 10)
  last = DateSerial(2024, 3, 11)
  first_time = TimeSerial(22, 0, 0)
  last_time = TimeSerial(2, 0, 0)
  Say "difference", u.GetTimeDifference(first, last, first_time, last_time)
  Say "difference.back", first & " " & last & " " & first_time & " " & last_time
  last = DateSerial(2024, 3, 11)
  Say "utc", u.UTCToLocalTime(u.LocalTimeToUTC(last)) = last
End Sub

Sub Durations
  Dim hours
  Say "duration", u.DateTimeToDuration("2/1/1800 02:00")
  Say "duration.number", u.ConvertDurationToNumber("01:45")
  hours = " 1.5 "
  Say "duration.minutes", u.ConvertDatabaseDurationToMinutes(u.DurToTime(hours))
  Say "duration.back", "[" & hours & "]"
End Sub

Sub Settings
  Dim ini, key, output
  ini = folder & "client.ini"
  key = "Software\TALUtil Clients\" & client
  u.sDatabaseName = "Clients"
  u.sUserName = client
  output = "north"
  u.SaveCfgFileData "Branch", "Name", output, ini, True
  Say "setting", u.GetCfgFileData("branch", "name", "none", ini, True)
  output = "\\server\share"
  u.SaveCfgFileData "Branch", "Path", output, ini, True
  Say "setting.back", output
  output = "stored"
  u.SaveCfgFileData client, "Name", output, "any"
  Say "setting.store", u.GetCfgFileData(client, "Name", "none", "any")
  u.REGISTRY_CreateNewKey key, &H80000001
  u.REGISTRY_SetKeyValue key, "Number", 42, 4
  Say "registry", u.REGISTRY_ReturnValue(key, "Number")
End Sub

Sub Files
  u.SaveTextBox "a line", folder & "in\a.txt"
  u.SaveTextBox u.CryptoEncryptString("branch 12"), folder & "in\b.txt"
  Say "files", u.GetFileList(",", folder & "in\", "*.txt")
  u.CallZIPFiles folder & "a.zip", folder & "in", 0, ""
  u.CallUnZIPFiles folder & "a.zip", folder & "out\", ""
  Say "zip", Left(u.LoadTextBox(folder & "out\in\a.txt"), 6)
  Say "secret", u.CryptoDecryptString(u.StripNulls(Replace(u.LoadTextBox(folder & "out\in\b.txt"), vbCrLf, "")))
  u.sORVPath = folder
  u.EventLog = 1
  u.AppendEventLog "Saved", "frmBooking"
  Say "log", InStr(u.LoadTextBox(folder & "EventLog.txt"), ":Saved:frmBooking") > 0
End Sub

Sub Controls
  Dim grid, position
  Set grid = CreateObject("TALUtil.Grid")
  grid.Cols = 3
  grid.ColWidth(1) = 480
  u.SaveGridWidths grid, client, 1
  grid.ColWidth(0) = 0
  grid.ColWidth(1) = 0
  u.LoadGridWidths grid, client, 1
  Say "widths", grid.ColWidth(0) & " " & grid.ColWidth(1) & " " & grid.ColWidth(2)
  Set position = CreateObject("TALUtil.cControlPosition")
  position.ControlName = client
  position.left = 120
  position.SaveControlPosition
  position.left = 0
  position.GetControlPosition
  Say "position", position.left
End Sub

Sub Report
  Dim grid, pdf
  pdf = "C:\TAL\ORV3\DATA\MONTHLYREPORTS\SalesReport.pdf"
  u.DeleteFiles pdf
  Set grid = CreateObject("TALUtil.Grid")
  grid.Cols = 2
  grid.AddItem "Job" & vbTab & "Done"
  grid.FixedRows = 1
  grid.AddItem "1001" & vbTab & "True"
  grid.ColDataType(1) = 11
  Say "ticks", u.CountGridSelectedRows(1, grid)
  u.AutomatedEndOfMonth = True
  u.GridPrintPreview 100, 2, "Sales", "", grid, DateSerial(2009, 3, 1), DateSerial(2009, 3, 31), "SalesReport"
  Say "report", Left(u.LoadTextBox(pdf), 5)
End Sub

' To be called while On Error Resume Next is in force, right after the statement that should fail.
Sub SayError(name)
  Say name, (Err.Number And 65535) & " " & Err.Description
  Say name & ".source", Err.Source
  Err.Clear
End Sub

Sub Errors
  On Error Resume Next
  u.IncWeek DateSerial(2009, 3, 5), 4682
  SayError "error.overflow"
  u.DrawTextPictureBox = "a text"
  SayError "error.object"
  u.CryptoDecryptString "QUJD"
  SayError "error.own"
End Sub

Set u = CreateObject("TALUtil.ORVUtils")
u.VerifyFilePath folder & "in\"
Texts
Lists
Dates
Durations
Settings
Files
Controls
Report
Errors
u.Terminate
Say "done", True
