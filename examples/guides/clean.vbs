' Cleans the fields of a form before they are stored.
Set u = CreateObject("TALUtil.ORVUtils")
u.iCharactercase = 1
WScript.Echo "[" & u.ConvertCase(0, u.VerifyTextData(40, 1, "  JOHN MCDONALD, PTY ")) & "]"
WScript.Echo "[" & u.VerifyTextData(0, 3, "12 Smith St, Ryde") & "]"
WScript.Echo "[" & u.VerifyIntData(0, "120.50kg") & "]"
WScript.Echo "[" & u.VerifyIntData(1, Null) & "]"
WScript.Echo u.VerifyEmail("john@example.com") & " " & u.VerifyEmail("john")
WScript.Echo u.CounterVerifyText & " texts cleaned"
