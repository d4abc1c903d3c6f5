' Cleans a CSV file field by field with TALUtil.ORVUtils and writes it as SQL inserts, with late-bound calls only:
'
'   cscript //nologo customers.vbs CSV PLAN OUTPUT [REPORT]
'
' The plan is the same as for "talutil clean", and so is every byte of the result. The printed lines are also written
' to the report file, because a console cannot show every character of code page 1252. Next to the output are a copy
' of it (.bak) and EventLog.txt, a log of what was done. The last line printed is "done"; if it is missing, an error
' has ended the script.
Option Explicit

Dim utils, report
On Error Resume Next
Set utils = CreateObject("TALUtil.ORVUtils")
If Err.Number <> 0 Then Fail "TALUtil.ORVUtils cannot be created (error " & Err.Number & "); register TALUtil.dll first"
On Error GoTo 0
Main WScript.Arguments
utils.Terminate
WScript.Echo "done"

Sub Main(arguments)
  Dim files, started, size
  If arguments.Count < 3 Then Fail "usage: cscript //nologo customers.vbs CSV PLAN OUTPUT [REPORT]"
  Set files = CreateObject("Scripting.FileSystemObject")
  If arguments.Count > 3 Then Set report = files.CreateTextFile(arguments(3), True)
  started = Timer
  utils.CounterVerifyText = 0
  utils.CounterVerifyInt = 0
  utils.sDatabaseName = "Demo"
  utils.sUserName = "demo"
  utils.iCharactercase = Choice("NameCase")
  utils.iCharacterCaseSuburbs = Choice("SuburbCase")
  size = CleanFile(files, arguments(0), arguments(1), arguments(2))
  Say "CounterVerifyText " & utils.CounterVerifyText & ", CounterVerifyInt " & utils.CounterVerifyInt
  Say size & " bytes of inserts to " & arguments(2) & " in " & Int((Timer - started) * 1000) / 1000 & " s"
  KeepRecord arguments(0), arguments(2)
End Sub

' The case style that the user has chosen; until then name case, which is saved in the user's settings.
Function Choice(name)
  Choice = utils.GetCfgFileData("Cleaning", name, "1", utils.sNatNameD)
End Function

' Copies the result line by line and records that in the event log next to it.
Sub KeepRecord(ByVal csvPath, ByVal sqlPath)
  utils.CopyFileToBackupFile sqlPath, sqlPath & ".bak"
  utils.EventLog = 1
  utils.sORVPath = utils.ExtractPathName(sqlPath)
  utils.AppendEventLog utils.ExtractFilename(csvPath) & " cleaned", "customers.vbs"
End Sub

Function CleanFile(files, csvPath, planPath, sqlPath)
  Dim parts, part, rest, columns(50), columnCount, steps, opening, output, row(50), count, rowCount, insert
  Dim changes(50), firsts(50)
  parts = Split(ReadFile(files, csvPath), """")
  If UBound(parts) Mod 2 = 1 Then Fail csvPath & ": a quote is never closed"
  part = 0
  rest = parts(0)
  columnCount = ReadRow(parts, part, rest, columns)
  steps = ReadPlan(ReadFile(files, planPath), columns, columnCount)
  opening = InsertOpening(columns, columnCount)

  CleanFile = 0
  Set output = files.CreateTextFile(sqlPath, True)
  rowCount = 0
  Do
    count = ReadRow(parts, part, rest, row)
    If count = 0 Then Exit Do
    rowCount = rowCount + 1
    If count <> columnCount Then Fail "row " & rowCount & " has " & count & " fields, the header " & columnCount
    insert = opening & CleanRow(row, count, steps, changes, firsts) & ");" & vbCrLf
    CleanFile = CleanFile + Len(insert)
    output.Write insert
  Loop
  output.Close

  Say rowCount & " rows of " & columnCount & " columns; fields changed, with the first of each:"
  SayColumns columns, columnCount, changes, firsts
End Function

' The cleaned fields of a row as SQL values. Here and in ReadRow every statement runs twenty thousand times; engines
' look variables up by name, so these functions have few.
Function CleanRow(row, count, steps, changes, firsts)
  Dim after, i, before, values
  values = "'"
  For i = 0 To count - 1
    before = row(i)
    after = CleanStep(steps(i), before)
    ' Compare the length first: that is faster, and some engines ignore NUL characters in comparisons.
    If Len(after) <> Len(before) Then
      NoteChange changes, firsts, i, before, after
    ElseIf after <> before Then
      NoteChange changes, firsts, i, before, after
    End If
    If InStr(after, "'") > 0 Then after = Replace(after, "'", "''")
    values = values & after & "', '"
  Next
  CleanRow = Left(values, Len(values) - 3)
End Function

' Counts the changes in a column and keeps the first one.
Sub NoteChange(changes, firsts, column, before, after)
  If IsEmpty(firsts(column)) Then firsts(column) = Array(before, after)
  changes(column) = changes(column) + 1
End Sub

' ---- Reading. A file is split at its quotes: parts 0, 2, 4 ... are outside of quotes, the others inside, and an
' empty part outside is a doubled quote. "rest" is what remains of the current part.

Function ReadFile(files, path)
  Dim stream
  Set stream = files.OpenTextFile(path, 1)
  ReadFile = stream.ReadAll
  stream.Close
End Function

' Fills the row and returns the number of its fields; 0 at the end.
Function ReadRow(parts, part, rest, row)
  Dim field, i, count, cells, rowEnd
  ReadRow = 0
  If rest = "" And part = UBound(parts) Then Exit Function
  field = ""
  count = 0
  Do
    rowEnd = InStr(rest, vbCrLf)
    If rowEnd > 0 Then cells = Split(Left(rest, rowEnd - 1), ",") Else cells = Split(rest, ",")
    If UBound(cells) >= 0 Then
      field = field & cells(0)
      For i = 1 To UBound(cells)
        row(count) = field
        count = count + 1
        field = cells(i)
      Next
    End If
    If rowEnd > 0 Then
      rest = Mid(rest, rowEnd + 2)
      Exit Do
    End If
    rest = ""
    If part = UBound(parts) Then Exit Do
    Do
      field = field & parts(part + 1)
      part = part + 2
      rest = parts(part)
      If rest <> "" Or part = UBound(parts) Then Exit Do
      field = field & """"
    Loop
  Loop
  row(count) = field
  ReadRow = count + 1
End Function

' ---- The plan: one step per column, as an array of words: a member and its arguments, "list" and the step for its
' elements, or "chain" and the array of steps joined by "|".

Function ReadPlan(text, columns, columnCount)
  Dim lines, i, column, blank, found(50)
  lines = Split(Replace(text, vbCr, ""), vbLf)
  For column = 0 To columnCount - 1
    For i = 0 To UBound(lines)
      blank = InStr(lines(i), " ")
      If blank > 1 Then
        If Left(lines(i), blank - 1) = columns(column) Then found(column) = StepFrom(Mid(lines(i), blank))
      End If
    Next
    If IsEmpty(found(column)) Then Fail "the plan has no line for column " & columns(column)
  Next
  ReadPlan = found
End Function

Function StepFrom(ByVal text)
  Dim links, i
  Do While InStr(text, "  ") > 0
    text = Replace(text, "  ", " ")
  Loop
  text = Trim(text)
  If InStr(text, "|") > 0 Then
    links = Split(text, "|")
    For i = 0 To UBound(links)
      links(i) = StepFrom(links(i))
    Next
    StepFrom = Array("chain", links)
  ElseIf Left(text, 5) = "list " Then
    StepFrom = Array("list", StepFrom(Mid(text, 6)))
  Else
    StepFrom = Split(text, " ")
  End If
End Function

' ---- Cleaning.

Function CleanStep(words, value)
  Select Case words(0)
    Case "VerifyTextData"
      CleanStep = utils.VerifyTextData(words(1), words(2), value)
    Case "VerifyIntData"
      CleanStep = utils.VerifyIntData(words(1), value)
    Case "VerifyMemField"
      CleanStep = utils.VerifyMemField(value)
    Case "ConvertCase"
      CleanStep = utils.ConvertCase(words(1), value)
    Case "ConvertCaseSuburbs"
      CleanStep = utils.ConvertCaseSuburbs(value)
    Case "list"
      CleanStep = CleanList(words(1), value)
    Case "chain"
      CleanStep = CleanChain(words(1), value)
    Case Else
      Fail "this script knows no step " & words(0)
  End Select
End Function

' Close an open list first, because the reader drops the text after the last comma.
Function CleanList(words, ByVal value)
  Dim list, count, i
  CleanList = ""
  If value <> "" And Right(value, 1) <> "," Then value = value & ","
  count = utils.ReadCommaDelimStrToList(value, list)
  For i = 0 To count - 1
    CleanList = CleanList & CleanStep(words, list(i)) & ","
  Next
End Function

Function CleanChain(links, ByVal value)
  Dim link
  For Each link In links
    value = CleanStep(link, value)
  Next
  CleanChain = value
End Function

' ---- Writing and printing.

Function InsertOpening(columns, columnCount)
  Dim i
  InsertOpening = "INSERT INTO customers (" & columns(0)
  For i = 1 To columnCount - 1
    InsertOpening = InsertOpening & ", " & columns(i)
  Next
  InsertOpening = InsertOpening & ") VALUES ("
End Function

Sub SayColumns(columns, columnCount, changes, firsts)
  Dim width, i, line
  For i = 0 To columnCount - 1
    If Len(columns(i)) > width Then width = Len(columns(i))
  Next
  For i = 0 To columnCount - 1
    line = "  " & columns(i) & Space(width - Len(columns(i))) & Right(Space(7) & (0 + changes(i)), 7)
    If changes(i) > 0 Then line = line & "  " & Sample(firsts(i)(0)) & " -> " & Sample(firsts(i)(1))
    Say line
  Next
End Sub

' The start of a text, with control characters made visible.
Function Sample(value)
  Const longest = 34
  Dim i, character
  Sample = """"
  For i = 1 To Len(value)
    If i > longest Then Exit For
    character = Mid(value, i, 1)
    Select Case Asc(character)
      Case 9: character = "\t"
      Case 10: character = "\n"
      Case 13: character = "\r"
      Case 34, 92: character = "\" & character
      Case Else
        If Asc(character) < 32 Then character = "\u" & Right("000" & LCase(Hex(Asc(character))), 4)
    End Select
    Sample = Sample & character
  Next
  Sample = Sample & """"
  If Len(value) > longest Then Sample = Sample & "..."
End Function

Sub Say(line)
  WScript.Echo line
  If Not IsEmpty(report) Then report.Write line & vbCrLf
End Sub

Sub Fail(message)
  WScript.Echo "customers.vbs: " & message
  WScript.Quit 1
End Sub
