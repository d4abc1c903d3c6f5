' Times the lines of a text file of 60 MB, late-bound, against the platform's own text stream.
'   cscript //nologo lines.vbs FILE
Option Explicit

Dim u, files, stream, list, line, count, i, ours, theirs, started
Set u = CreateObject("TALUtil.ORVUtils")
Set files = CreateObject("Scripting.FileSystemObject")

started = Timer
count = u.OpenFile(WScript.Arguments(0), list, 0)
ours = Timer - started
list = Empty

' A tenth of the file is enough: reading it all takes minutes.
started = Timer
Set stream = files.OpenTextFile(WScript.Arguments(0), 1)
For i = 1 To count \ 10
  line = stream.ReadLine
Next
stream.Close
theirs = (Timer - started) * 10
u.Terminate
WScript.Echo "lines of 60 MB: OpenFile " & FormatNumber(ours, 2) & " s, TextStream " & FormatNumber(theirs, 2) & _
  " s (a tenth of it measured), ratio " & FormatNumber(ours / theirs, 2) & " (goal: at most 0.20)"
