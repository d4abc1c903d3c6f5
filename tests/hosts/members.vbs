' What hosts do with the members, as scripts write it: bound late, variables written back, run-time errors by number and
' text. Each line that is printed is NAME=VALUE; what it should be stands behind it. Comments that begin with the name of a
' client are for that client alone and take the place of the common value; - stands for no line at all.
'
'   cscript //nologo members.vbs CLIENT
'
' CLIENT keeps the files and settings of one run apart from those of others. A script control runs this file too. As far
' as the line of dashes it is run as JScript, into which to_jscript.awk turns it, and compiled clients do the same as far
' as the double line; docs/clients.md says what differs.
Option Explicit
On Error Resume Next

Dim u, v, client, folder, list, names, character, missing, week, first, last, first_time, last_time, hours
Dim ini, key, output, secret, grid, position, pdf, other, d, zip

Sub Say(name, value)
  WScript.Echo name & "=" & value
End Sub

' Where errors come from is said only if it is not the library.
Sub SayError(name)
  Say name, (Err.Number And 65535) & " " & Err.Description
  If Err.Source <> "TALUtil.ORVUtils" Then Say name & ".source", Err.Source
  Err.Clear
End Sub

' For errors that the script host words itself.
Sub SayHostError(name)
  Say name, Err.Number & " " & Err.Description
  Err.Clear
End Sub

Class ValueHolder
  Public Default Property Get Value
    Value = "u"
  End Property
End Class

client = WScript.Arguments(WScript.Arguments.Count - 1)
folder = "C:\clients\" & client & "\"
Set u = CreateObject("TALUtil.ORVUtils")
Call u.VerifyFilePath(folder & "in\")

Say "text", u.VerifyTextData(20, 1, "  Smith & ""Sons"", Pty #1  ") '= Smith and Sons Pty 1
Say "text.apostrophe", Asc(Mid(u.VerifyTextData(0, 0, "O'Brien"), 2, 1)) '= 180
Say "number", u.VerifyIntData(0, "3.50kg") '= 3.5
Say "number.null", u.VerifyIntData(1, Null) '= 0
u.iCharactercase = 1
Say "case", u.ConvertCase(0, "MARY SMITH-JONES") '= Mary Smith-Jones
list = Empty
Say "list", u.ReadCommaDelimStrToList("red,green,blue,", list) '= 3
Say "list.items", list(0) & "/" & list(1) & "/" & list(2) '= red/green/blue
'jscript: list.items=-
names = Array("Apple", "Banana")
Say "list.index", u.IndexInList(names, "ban") '= 1
'jscript: list.index=-
Say "field", u.GetData("A,B,C,", 1, 2) '= B
character = ""
Say "blanks", u.RemoveStringsFromNumber(2, "A B", character) '= AB
Say "blanks.back", "[" & character & "]" '= [ ]
'jscript: blanks.back=[]
missing = "00:00:00"
Say "date", Year(u.VerifyNullDate(0, missing)) '= 1980
Say "date.back", missing '= 01/01/1980
'jscript: date.back=00:00:00
'pascal: date.typed=01/01/1980
Say "month", u.IncMonth(DateSerial(2009, 1, 31), 1) '= 28/02/2009
Say "week", u.GetWeekNumber(DateSerial(2009, 12, 31)) '= 52
week = 60
Say "week.start", Month(u.WeekYearToDate(week, 2009, 1)) '= 12
Say "week.back", week '= 52
'jscript: week.back=60
first = DateSerial(2024, 3, 10)
last = DateSerial(2024, 3, 11)
first_time = TimeSerial(22, 0, 0)
last_time = TimeSerial(2, 0, 0)
Say "difference", u.GetTimeDifference(first, last, first_time, last_time) '= 4:0
Say "difference.back", first & " " & last & " " & first_time & " " & last_time '= 10/03/2024 11/03/2024 22:00 02:00
'jscript: difference.back=10/3/2024 11/3/2024 22:00 2:00
'pascal_late: difference.typed=0:0
'pascal_late: difference.typed.back=11/03/2024 22:00
'pascal_early: record=3-22 11/03/2024 22:00
last = DateSerial(2024, 3, 11)
Say "utc", u.UTCToLocalTime(u.LocalTimeToUTC(last)) = last '= True
'jscript: utc=-
Say "duration", u.DateTimeToDuration("2/1/1800 02:00") '= 26:0
Say "duration.number", u.ConvertDurationToNumber("01:45") '= 1.75
hours = " 1.5 "
Say "duration.minutes", u.ConvertDatabaseDurationToMinutes(u.DurToTime(hours)) '= 90
Say "duration.back", "[" & hours & "]" '= [1.5]
'jscript: duration.back=[ 1.5 ]
ini = folder & "client.ini"
u.sDatabaseName = "Clients"
u.sUserName = client
output = "north"
Call u.SaveCfgFileData("Branch", "Name", output, ini, True)
Say "setting", u.GetCfgFileData("branch", "name", "none", ini, True) '= north
output = "\\server\share"
Call u.SaveCfgFileData("Branch", "Path", output, ini, True)
Say "setting.back", output '= \
'jscript: setting.back=\\server\share
Set grid = CreateObject("TALUtil.Grid")
grid.Cols = 3
grid.ColWidth(1) = 480
Call u.SaveGridWidths(grid, client, 1)
grid.ColWidth(0) = 0
grid.ColWidth(1) = 0
Call u.LoadGridWidths(grid, client, 1)
Say "widths", grid.ColWidth(0) & " " & grid.ColWidth(1) & " " & grid.ColWidth(2) '= 0 480 1000
Set position = CreateObject("TALUtil.cControlPosition")
position.ControlName = client
position.left = 120
Call position.SaveControlPosition()
position.left = 0
Call position.GetControlPosition()
Say "position", position.left '= 120
v = u.IncWeek("5/3/2009", 4682) : SayError "error.overflow" '= 6 Overflow
u.DrawTextPictureBox = "a text" : SayError "error.object" '= 13 Type mismatch
v = u.CryptoDecryptString("QUJD") : SayError "error.own" '= 5 This is not a cipher text of this library, or it was changed
Say "done", True '= True
'=======================================================================================================================
output = "stored"
Call u.SaveCfgFileData(client, "Name", output, "any")
Say "setting.store", u.GetCfgFileData(client, "Name", "none", "any") '= stored
key = "Software\TALUtil Clients\" & client
Call u.REGISTRY_CreateNewKey(key, -2147483647)
Call u.REGISTRY_SetKeyValue(key, "Number", 42, 4)
Say "registry", u.REGISTRY_ReturnValue(key, "Number") '= 42
Call u.SaveTextBox("a line", folder & "in\a.txt")
Call u.SaveTextBox(u.CryptoEncryptString("branch 12"), folder & "in\b.txt")
Say "files", u.GetFileList(",", folder & "in\", "*.txt") '= a.txt,b.txt
Call u.CallZIPFiles(folder & "a.zip", folder & "in", 0, "")
Call u.CallUnZIPFiles(folder & "a.zip", folder & "out\", "")
Say "zip", Left(u.LoadTextBox(folder & "out\in\a.txt"), 6) '= a line
secret = u.LoadTextBox(folder & "out\in\b.txt")
Say "secret", u.CryptoDecryptString(Left(secret, Len(secret) - 2)) '= branch 12
u.sORVPath = folder
u.EventLog = 1
Call u.AppendEventLog("Saved", "frmBooking")
Say "log", InStr(u.LoadTextBox(folder & "EventLog.txt"), ":Saved:frmBooking") > 0 '= True
pdf = "C:\TAL\ORV3\DATA\MONTHLYREPORTS\SalesReport.pdf"
Call u.DeleteFiles(pdf)
Set grid = CreateObject("TALUtil.Grid")
grid.Cols = 2
Call grid.AddItem("Job" & Chr(9) & "Done")
grid.FixedRows = 1
Call grid.AddItem("1001" & Chr(9) & "True")
grid.ColDataType(1) = 11
Say "ticks", u.CountGridSelectedRows(1, grid) '= 1
u.AutomatedEndOfMonth = True
Call u.GridPrintPreview(100, 2, "Sales", "", grid, DateSerial(2009, 3, 1), DateSerial(2009, 3, 31), "SalesReport")
u.AutomatedEndOfMonth = False
Say "report", Left(u.LoadTextBox(pdf), 5) '= %PDF-
'jscript: combo=1
'jscript: combo.text=[]
'jscript: widths.own=0 480 1000
'jscript: list.variable=undefined
'jscript: error.list=13 Type mismatch
'-----------------------------------------------------------------------------------------------------------------------
Set other = CreateObject("TALUtil.ORVUtils")
Say "another object", (other.sUserName = client) & " " & other.WriteServerPerformanceFile '= True False
Set u.FolderBrowseForm = Nothing
u.BookingScreenDate = DateSerial(2009, 7, 1)
Say "BookingScreenDate", u.BookingScreenDate = DateSerial(2009, 7, 1) '= True
Say "types", TypeName(u.GetYear(0)) & TypeName(u.MyPos("", "", 0)) & TypeName(u.VerifyEmail("")) & _
  TypeName(u.ConvertDurationToNumber("1")) & TypeName(u.VerifyNullDate(0, Empty)) & TypeName(u.BookingScreenDate) & _
  TypeName(u.WeekYearToDate(1, 2009, 7)) & TypeName(u.AddZeros(7, 3, 1)) & TypeName(u.ConvertCase(0, Null)) '= IntegerLongBooleanSingleDateDateEmptyStringNull
Say "values", u.VerifyTextData(0, 0, 12.5) & u.VerifyTextData(0, 0, New ValueHolder) & u.VerifyIntData(0, Empty) '= 12.5u0

Say "identifiers", Len(u.GetNewGuid) & " " & (u.GetNewGuid <> u.GetNewGuid) '= 38 True
list = Array("first", "", "last")
Call u.SaveBigFile(list, folder & "b.txt")
Say "OpenFile", u.OpenFile(folder & "b.txt", list, 0) & u.OpenBigFile(folder & "b.txt", list, 1) & list(1) '= 32last
d = TimeSerial(1, 30, 0)
Say "DateTimeToDuration", u.DateTimeToDuration(d) & " of " & d '= 1:30 of 1/1/1800 01:30

Call grid.AddItem("1002" & vbTab & "False")
grid.TextMatrix(1, 0) = "a,b"
Call u.SelectGridRows(1, grid, 1)
Set zip = CreateObject("TALUtil.ZipControl")
Say "tables", grid.TextMatrix(1, 0) & " " & u.CountGridSelectedRows(1, grid) & " " & zip.CompressionLevel '= a,b 2 6
grid.TextMatrix(9, 0) = "x" : Say "no such row", Err.Number : Err.Clear '= 9
u.LoadWindowState grid, "Members" : SayError "no form" '= 438 Object doesn't support this property or method
Set u.DrawTextPictureBox = CreateObject("Scripting.Dictionary") : SayError "a dictionary to draw on" '= 13 Type mismatch
u.ComputerName = "x" : SayHostError "a put on ComputerName" '= 438 Object doesn't support this property or method
Set v = u.SplashForm : SayHostError "a get of SplashForm" '= 438 Object doesn't support this property or method
u.NoSuchMember : SayHostError "an unknown member" '= 438 Object doesn't support this property or method
v = u.VerifyTextData(0, 0, Nothing) : SayError "Nothing" '= 91 Object variable or With block variable not set
v = u.VerifyTextData(Null, 0, "a") : SayError "Null for a number" '= 94 Invalid use of Null
v = u.IndexInList("no list", "a") : SayError "a text for a list" '= 13 Type mismatch
' The script host words this one itself.
v = u.StripNulls() : Say "no argument", Err.Number : Err.Clear '= 449
v = u.StripNulls("a", "b") : SayHostError "two arguments" '= 450 Wrong number of arguments or invalid property assignment
u.SaveTextBox "x", "Q:\a.txt" : SayError "a missing drive" '= 76 Path not found
u.SystemTimeToDate Null, v : SayError "no record" '= 13 Type mismatch
u.Terminate
