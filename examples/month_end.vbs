' An unattended month-end run with TALUtil.ORVUtils: turns tables into the three reports that hosts expect, as PDF
' files, without showing a window.
'
'   cscript //nologo month_end.vbs CUSTOMERS BOOKINGS FOLDER
'
' The reports are written where hosts look for them, then copied to the folder. The last line printed is "done"; if it
' is missing, an error has ended the script.
Option Explicit

Const commaText = 3
Const landscape = 2
Const reports = "C:\TAL\ORV3\DATA\MONTHLYREPORTS\"

Dim utils, files, customers, bookings
Set files = CreateObject("Scripting.FileSystemObject")
Set utils = CreateObject("TALUtil.ORVUtils")
utils.AutomatedEndOfMonth = True
utils.sGridPaperSize = "A4"

Set customers = TableOf(WScript.Arguments(0))
customers.FixedRows = 1
customers.ColHidden(2) = True
WriteReport "SalesReport", "Sales", customers, "1/3/2009", "31/3/2009"
customers.ColHidden(7) = True
customers.ColHidden(8) = True
WriteReport "BadDebtsReport", "Bad Debts", customers, Empty, Empty
Set bookings = TableOf(WScript.Arguments(1))
WriteReport "BankSummaryReport", "Bank Summary", bookings, "DateTimeOnly", "31/3/2009 18:30"
utils.Terminate
WScript.Echo "done"

Function TableOf(file)
  Dim table, column
  Set table = CreateObject("TALUtil.Grid")
  table.LoadGrid file, commaText
  For column = 0 To table.Cols - 1
    table.ColWidth(column) = 1600
  Next
  Set TableOf = table
End Function

Sub WriteReport(name, title, table, first, last)
  utils.GridPrintPreview 100, landscape, title, "", table, first, last, name
  files.CopyFile reports & name & ".pdf", WScript.Arguments(2) & "\" & name & ".pdf"
  WScript.Echo name & ".pdf: " & table.Rows & " rows"
End Sub
