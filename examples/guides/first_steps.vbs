' The first call from a script: cscript //nologo first_steps.vbs
Set u = CreateObject("TALUtil.ORVUtils")
WScript.Echo u.VerifyTextData(20, 1, "  Smith & Sons, Pty  ")
WScript.Echo u.AddZeros("7", 3, -1)
u.Terminate
