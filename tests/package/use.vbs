' Uses the installed library: cscript //nologo use.vbs [FOLDER]
' With a folder, it holds the library from the time that it makes the file "holding" there until a file "release" appears.
Option Explicit
Dim u, list, folder, files

Set u = CreateObject("TALUtil.ORVUtils")
If WScript.Arguments.Count > 0 Then
  folder = WScript.Arguments(0)
  Set files = CreateObject("Scripting.FileSystemObject")
  files.CreateTextFile(folder & "\holding").Close
  Do Until files.FileExists(folder & "\release")  ' Wine's script host has no Sleep.
  Loop
End If
WScript.Echo u.ReadCommaDelimStrToList("red,green,blue,", list) & " " & list(1)
u.Terminate
