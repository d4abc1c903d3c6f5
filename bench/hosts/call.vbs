' Times a small text member, late-bound, against one of the platform's own objects in the same loop.
Option Explicit

Const repetitions = 11
Const calls = 2000

Dim u, f, i, j, k, s, start, middle, finish, ours(10), theirs(10), ratios(10)
Set u = CreateObject("TALUtil.ORVUtils")
Set f = CreateObject("Scripting.FileSystemObject")

Function Median(values)
  Dim a, b, swap, sorted
  sorted = values
  For a = 0 To UBound(sorted) - 1
    For b = a + 1 To UBound(sorted)
      If sorted(b) < sorted(a) Then
        swap = sorted(a)
        sorted(a) = sorted(b)
        sorted(b) = swap
      End If
    Next
  Next
  Median = sorted(UBound(sorted) \ 2)
End Function

' The first repetition warms up and is not counted.
For i = -1 To repetitions - 1
  start = Timer
  For j = 1 To calls
    s = u.StripNulls("a.txt")
    s = u.StripNulls("a.txt")
    s = u.StripNulls("a.txt")
    s = u.StripNulls("a.txt")
  Next
  middle = Timer
  For j = 1 To calls
    s = f.GetExtensionName("a.txt")
    s = f.GetExtensionName("a.txt")
    s = f.GetExtensionName("a.txt")
    s = f.GetExtensionName("a.txt")
  Next
  finish = Timer
  If i >= 0 Then
    ours(i) = (middle - start) * 1000000 / (4 * calls)
    theirs(i) = (finish - middle) * 1000000 / (4 * calls)
    ratios(i) = ours(i) / theirs(i)
  End If
Next
u.Terminate
WScript.Echo "late-bound text call: StripNulls " & FormatNumber(Median(ours), 2) & " us, GetExtensionName " & _
  FormatNumber(Median(theirs), 2) & " us, ratio " & FormatNumber(Median(ratios), 2) & " (goal: at most 1.00)"
