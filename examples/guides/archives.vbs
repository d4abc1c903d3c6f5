' Packs two files with the zip control and unpacks one of them.
Option Explicit
Dim u, zip, unzip, folder
Set u = CreateObject("TALUtil.ORVUtils")
Set zip = CreateObject("TALUtil.ZipControl")
Set unzip = CreateObject("TALUtil.UnzipControl")
folder = CreateObject("Scripting.FileSystemObject").GetSpecialFolder(2) & "\TALUtil guide"
u.DeleteFiles folder & "\*.*"
u.VerifyFilePath folder & "\"
u.SaveTextBox "minutes", folder & "\notes.txt"
u.SaveTextBox "120", folder & "\prices.txt"

zip.ZIPFile = folder & "\backup.zip"
zip.ItemList = """" & folder & "\notes.txt"" """ & folder & "\prices.txt"""
zip.NoDirectoryNames = True
zip.Encrypt = True
zip.StrongEncryption = True
zip.Password = "7dB!s2"
zip.Action = 4
WScript.Echo "packed: " & zip.ErrorCode & zip.ErrorText

unzip.ZIPFile = zip.ZIPFile
unzip.Password = "7dB!s2"
unzip.Action = 7
WScript.Echo "tested: " & unzip.ErrorCode & ", " & unzip.EntryCount & " entries"

unzip.ItemList = "notes.txt"
unzip.Destination = folder & "\restored"
unzip.Overwrite = True
unzip.Action = 8
WScript.Echo "unpacked: " & unzip.ErrorCode & " " & u.FileExists(folder & "\restored\notes.txt")

unzip.ItemList = "other.txt"
unzip.Action = 8
WScript.Echo "nothing matches: " & unzip.ErrorCode
