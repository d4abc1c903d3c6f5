' What depends on where a script runs: cscript //nologo elsewhere.vbs no_screen | cipher CIPHER_TEXT OUTPUT.
' The answers are printed in one line.
Option Explicit
On Error Resume Next
Dim u, v, said, plain

Sub SayError
  said = said & Err.Number & " " & Err.Description & ". "
  Err.Clear
End Sub

Set u = CreateObject("TALUtil.ORVUtils")
Select Case WScript.Arguments(0)
  Case "no_screen"
    u.ShowSysInfo : SayError
    u.ShowShortCutKeys : SayError
    v = u.MyInputBox("Who?", "What is your name?") : SayError
  Case "cipher"  ' Opens a text that the native command has made, and writes one of its own for the command to open.
    plain = "O" & Chr(180) & "Neil, 5 " & Chr(128)
    said = CInt(u.CryptoDecryptString(WScript.Arguments(1)) = plain)
    CreateObject("Scripting.FileSystemObject").CreateTextFile(WScript.Arguments(2), True).Write u.CryptoEncryptString(plain)
End Select
u.Terminate
WScript.Echo said
