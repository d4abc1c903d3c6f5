// Controls of a host, here made of plain objects: cscript //nologo own_controls.js
var u = new ActiveXObject("TALUtil.ORVUtils");
u.sDatabaseName = "Guide";
u.sUserName = "anne";
u.sNatNameC = "USER";

// A list of branches with their numbers: which entry has number 12?
var branches = {Text: "", ListCount: 3, ItemData: function (index) { return [7, 12, 31][index]; }};
WScript.Echo("entry " + u.GetComboListIndex(branches, 12));

// A form that keeps its size.
var form = {WindowState: 0, Width: 9000, Height: 6000};
u.SaveWindowState(form, "Jobs");
form.Width = 100;
u.LoadWindowState(form, "Jobs");
WScript.Echo("width " + form.Width);

// A button that its user drags by 300 twips to the right, and far beyond the lower edge of its form.
var inside = {ScaleWidth: 9000, ScaleHeight: 6000};
var button = {left: 120, Top: 480, Width: 2400, Height: 600};
// A property that is an object has to be a function here, because it is asked for as either.
button.Container = function () { return inside; };
button.Move = function (left, top) { this.left = left; this.Top = top; };
var position = new ActiveXObject("TALUtil.cControlPosition");
position.ControlName = "frmJobs";
position.ControlID = 3;
position.DragStartX = 10;
position.DragStartY = 10;
position.DragControl(inside, button, 310, 99999);
WScript.Echo("at " + button.left + ", " + button.Top);
position.SaveControlPosition();

// At the next start.
position = new ActiveXObject("TALUtil.cControlPosition");
position.ControlName = "frmJobs";
position.ControlID = 3;
position.GetControlPosition();
WScript.Echo("saved " + position.left + ", " + position.Top);
u.Terminate();
