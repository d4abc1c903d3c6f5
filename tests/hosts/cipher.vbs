' Opens a cipher text that the native command has made, and writes one of its own for the command to open:
'
'   cscript //nologo cipher.vbs CIPHER_TEXT OUTPUT
Option Explicit

Dim u, plain, opened, file
Set u = CreateObject("TALUtil.ORVUtils")
plain = "O" & Chr(180) & "Neil, 5 " & Chr(128)
opened = u.CryptoDecryptString(WScript.Arguments(0))
Set file = CreateObject("Scripting.FileSystemObject").CreateTextFile(WScript.Arguments(1), True)
file.WriteLine u.CryptoEncryptString(plain)
file.Close
u.Terminate
If opened = plain Then WScript.Echo "1 passed, 0 failed" Else WScript.Echo "0 passed, 1 failed"
