' Dates are day first, and texts go in and out.
Set u = CreateObject("TALUtil.ORVUtils")
WScript.Echo u.VerifyNullDate(0, "5/3/09")
WScript.Echo u.IncMonth("31/1/2009", 1)
WScript.Echo u.GetNextDate("5/3/2009", "Weekly", 2)
WScript.Echo "week " & u.GetWeekNumber("5/3/2009") & " of financial year " & u.GetFinancialYearStr("5/3/2009")
WScript.Echo u.GetDaysInPeriod("1/3/2009", "31/3/2009") & " days"

' Durations are stored as a date after 1/1/1800, so that they can exceed a day.
stored = u.DurToTime("26.5")
WScript.Echo u.DateTimeToDuration(stored)
WScript.Echo u.ConvertDatabaseDurationToMinutes(stored) & " minutes"
WScript.Echo u.DateTimeToDuration(u.ConvertNumberToDatabaseDuration(90))
