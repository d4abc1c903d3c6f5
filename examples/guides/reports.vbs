' Writes a report as a PDF file, unattended: only these three captions have files.
Const landscape = 2
Const folder = "C:\TAL\ORV3\DATA\MONTHLYREPORTS\"
Set u = CreateObject("TALUtil.ORVUtils")
Set table = CreateObject("TALUtil.Grid")
table.Cols = 2
table.AddItem "Name" & vbTab & "Amount"
table.AddItem "Smith" & vbTab & "120"
table.AddItem "Jones" & vbTab & "80"
table.FixedRows = 1
table.ColWidth(0) = 3000

u.AutomatedEndOfMonth = True
u.sGridPaperSize = "A4"
For Each caption In Array("SalesReport", "BankSummaryReport", "BadDebtsReport")
  u.GridPrintPreview 100, landscape, "March", "", table, "1/3/2009", "31/3/2009", caption
  WScript.Echo caption & ".pdf: " & u.FileExists(folder & caption & ".pdf")
Next
u.AutomatedEndOfMonth = False
u.Terminate
