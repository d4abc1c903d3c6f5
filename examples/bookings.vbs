' Books a month of repeating jobs with TALUtil.ORVUtils, with late-bound calls only: prints each visit with its week
' and its duration as stored and as shown, then the totals of the month.
'
'   cscript //nologo bookings.vbs JOBS
'
' Each job is a line with its name, first visit, step word, number of steps and decimal hours, separated by commas.
' bookings.sh prints the same with the native command. The last line printed is "done"; if it is missing, an error
' has ended the script.
Option Explicit

Dim utils, jobs, minutes
Set utils = CreateObject("TALUtil.ORVUtils")
Set jobs = CreateObject("Scripting.FileSystemObject").OpenTextFile(WScript.Arguments(0))
minutes = 0
Do Until jobs.AtEndOfStream
  minutes = minutes + Book(jobs.ReadLine & ",")
Loop
WScript.Echo "March 2009, financial year " & utils.GetFinancialYearStr("1/3/2009") & ": " & minutes \ 60 & ":" & _
  minutes Mod 60 & " hours in " & utils.GetDaysInPeriod("1/3/2009", "31/3/2009") + 1 & " days"
WScript.Echo "the quarter ends in " & utils.GetMonthsInPeriod("31/3/2009", "30/6/2009") & " months"
utils.Terminate
WScript.Echo "done"

' Prints the visits of a job within its first month and returns their total minutes.
Function Book(job)
  Dim visit, month, stored, hours
  visit = utils.VerifyNullDate(0, utils.GetData(job, 1, 2))
  month = utils.GetMonth(visit)
  Book = 0
  Do While utils.GetMonth(visit) = month
    hours = utils.GetData(job, 4, 5)
    stored = utils.DurToTime(hours)
    WScript.Echo visit & "  week " & utils.GetWeekNumber(visit) & "  " & utils.GetData(job, 0, 1) & "  " & _
      utils.DateTimeToDuration(stored) & " (" & utils.ConvertDatabaseDurationToNumber(stored) & " h)"
    Book = Book + utils.ConvertDatabaseDurationToMinutes(stored)
    visit = utils.GetNextDate(visit, utils.GetData(job, 2, 3), utils.GetData(job, 3, 4))
  Loop
End Function
