' What depends on where a script runs: cscript //nologo elsewhere.vbs no_screen | code_page | cipher CIPHER_TEXT OUTPUT.
' The answers are printed in one line.
Option Explicit
On Error Resume Next
Dim u, v, said, olga, house, plain

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
  Case "code_page"  ' 1251: the members keep what its users write.
    olga = Chr(206) & Chr(235) & Chr(252) & Chr(227) & Chr(224)
    house = Chr(228) & Chr(238) & Chr(236)
    said = Asc(olga) & CInt(u.VerifyTextData(0, 0, " " & olga & " #5? ") = olga & " 5") & _
      CInt(u.RemoveNumberFromString(house & " 5?") = house) & u.RemoveStringsFromNumber(0, house & " 5", "") & _
      CInt(u.StringReplace(olga & "?", "?", "-") = olga & "-")
    ' Settings files, text files and registry values with such names and contents, in a folder of such a name.
    v = "C:\" & house & "\"
    u.VerifyFilePath v
    u.SaveTextBox olga, v & olga & ".txt"
    u.SaveCfgFileData olga, house, olga, v & olga & ".ini", False
    u.REGISTRY_CreateNewKey "Software\" & olga, &H80000001
    u.REGISTRY_SetKeyValue "Software\" & olga, house, olga, 1
    said = said & CInt(u.PathExists(v)) & CInt(u.LoadTextBox(v & olga & ".txt") = olga & vbCrLf) & _
      CInt(u.GetCfgFileData(olga, house, "none", v & olga & ".ini", False) = olga) & _
      CInt(u.REGISTRY_ReturnValue("Software\" & olga, house) = olga)
  Case "cipher"  ' Opens a text that the native command has made, and writes one of its own for the command to open.
    plain = "O" & Chr(180) & "Neil, 5 " & Chr(128)
    said = CInt(u.CryptoDecryptString(WScript.Arguments(1)) = plain)
    CreateObject("Scripting.FileSystemObject").CreateTextFile(WScript.Arguments(2), True).Write u.CryptoEncryptString(plain)
End Select
u.Terminate
WScript.Echo said
