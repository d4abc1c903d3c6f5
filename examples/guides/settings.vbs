' Keeps settings for a user and a database.
Set u = CreateObject("TALUtil.ORVUtils")
u.sDatabaseName = "Guide"
u.sUserName = "anne"
u.sNatNameD = "USER"
u.sORVDataName = "DATABASE"

u.SaveCfgFileData "Screen", "Colour", "red", "USER", False
WScript.Echo u.GetCfgFileData("Screen", "Colour", "none", "USER", False)

' A default is stored when it is used.
WScript.Echo u.GetCfgFileData("Screen", "Font", "Arial", "USER", False)

' What any user saves last is what the database has.
u.sUserName = "bert"
u.SaveCfgFileData "Screen", "Colour", "blue", "USER", False
WScript.Echo u.GetCfgFileData("Screen", "Colour", "none", "DATABASE", False)
u.sUserName = "anne"
WScript.Echo u.GetCfgFileData("Screen", "Colour", "none", "USER", False)

' The widths of a grid's columns are settings, too.
u.sNatNameC = "USER"
Set table = CreateObject("TALUtil.Grid")
table.Cols = 2
table.ColWidth(1) = 2400
u.SaveGridWidths table, "Bookings", 0
WScript.Echo u.GetCfgFileData("Bookings", "1ColWidth", "none", "USER", False)
