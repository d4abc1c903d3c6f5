' What comes before the examples in a script: the toolkit, and the controls and forms of a host that examples use. These
' are JScript objects, because objects of VBScript classes cannot be driven by name in every script host.
On Error Resume Next

Dim u, frmBooking, cboBranch, txtNotes, lstBranches, picSchedule, files, other_script, property_of
Set u = CreateObject("TALUtil.ORVUtils")
Set files = CreateObject("Scripting.FileSystemObject")
Set other_script = CreateObject("MSScriptControl.ScriptControl")
other_script.Language = "JScript"
Set property_of = other_script.Eval("(function (object, name) { return object[name]; })")

' A combo box whose searches find the second entry; a picture box with letters 120 twips wide, which remembers what was
' drawn last.
Sub NewHostObjects
  Set frmBooking = other_script.Eval("({WindowState: 0, Width: 0, Height: 0, hwnd: 0, Refresh: function () {}})")
  Set txtNotes = other_script.Eval("({Text: ''})")
  Set lstBranches = other_script.Eval("({ListCount: 3, List: function (i) { return ['North', 'South', 'West'][i]; }})")
  Set cboBranch = other_script.Eval("({Text: '', ListIndex: -1, ListCount: 3, SearchIndex: 1, SearchText: '', " & _
    "ColumnSearch: 0, SearchMethod: 0, Action: 0, Refresh: function () {}, " & _
    "ItemData: function (i) { return [10, 20, 30][i]; }})")
  Set picSchedule = other_script.Eval("({ScaleMode: 1, ScaleX: function (value) { return value; }, " & _
    "FontBold: false, ForeColor: 0, CurrentX: 0, CurrentY: 0, hDC: 0, Drawn: '', " & _
    "TextHeight: function () { return 240; }, " & _
    "TextWidth: function (text) { return 120 * text.length; }, Print: function (text) { this.Drawn = text; }})")
End Sub

' An empty folder, in place of what an earlier run has left.
Sub MakeFolder(path)
  If Not files.FolderExists("C:\EXAMPLES") Then files.CreateFolder "C:\EXAMPLES"
  If files.FolderExists(path) Then files.DeleteFolder path, True
  files.CreateFolder path
End Sub

NewHostObjects
