' TALUtil from an office macro, bound early: Tools, References, "TALUtil: common toolkit for booking and job
' scheduling" (or Browse to TALUtil.dll), then paste this into a module and run Example.
Option Explicit

Public Sub Example()
    Dim u As TALUtil.ORVUtils
    Dim list() As String
    Dim count As Long, week As Integer

    Set u = New TALUtil.ORVUtils
    Debug.Print u.VerifyTextData(20, 1, "  Smith & Sons, Pty  ")

    ' Variables that a call changes have the parameter's type: String(), Integer.
    count = u.ReadCommaDelimStrToList("red,green,blue,", list)
    Debug.Print count & " elements, the second is " & list(1)
    week = 60
    u.WeekYearToDate week, 2009, 1
    Debug.Print "week " & week

    On Error Resume Next
    u.GetWeekNumber "tomorrow"
    If Err.Number <> 0 Then Debug.Print "error " & Err.Number & ": " & Err.Description
End Sub
