' What scripts hear where there is no screen: cscript //nologo no_screen.vbs. The answers are printed in one line.
Option Explicit
On Error Resume Next
Dim u, v, said

Sub SayError
  said = said & Err.Number & " " & Err.Description & ". "
  Err.Clear
End Sub

Set u = CreateObject("TALUtil.ORVUtils")
u.ShowSysInfo : SayError
u.ShowShortCutKeys : SayError
v = u.MyInputBox("Who?", "What is your name?") : SayError
u.Terminate
WScript.Echo said
