' A script on a system whose ANSI code page is 1251: the members keep what its users write. The last line is the counts.
Option Explicit

Dim u, passed, failed, olga, house
passed = 0
failed = 0

Sub Check(name, expected, got)
  If expected = got Then
    passed = passed + 1
  Else
    failed = failed + 1
    WScript.Echo "FAILED code_page.vbs, " & name & ": expected """ & expected & """, got """ & got & """"
  End If
End Sub

Set u = CreateObject("TALUtil.ORVUtils")
olga = Chr(206) & Chr(235) & Chr(252) & Chr(227) & Chr(224)
house = Chr(228) & Chr(238) & Chr(236)
Check "the system's code page", 206, Asc(olga)
Check "VerifyTextData", olga & " 5", u.VerifyTextData(0, 0, " " & olga & " #5? ")
Check "RemoveNumberFromString", house, u.RemoveNumberFromString(house & " 5?")
Check "RemoveStringsFromNumber", "5", u.RemoveStringsFromNumber(0, house & " 5", "")
Check "StringReplace", olga & "-", u.StringReplace(olga & "?", "?", "-")
u.Terminate
WScript.Echo passed & " passed, " & failed & " failed"
