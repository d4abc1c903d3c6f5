' What windows answer where there is no screen: prints the error of each.
Option Explicit
On Error Resume Next
Dim u, v
Set u = CreateObject("TALUtil.ORVUtils")
Sub Tell
  WScript.Echo Err.Number & " " & Err.Description
  Err.Clear
End Sub
u.ShowSysInfo
Tell
u.ShowShortCutKeys
Tell
v = u.MyInputBox("Who?", "What is your name?")
Tell
