// What the JScript that is made of members.vbs finds: functions of the names that VBScript has, and what it does with an
// object of its own. Nothing that a call writes back reaches a variable here, an array is an object, not a list, and a
// date is a text.
var True = true, False = false, Null = null, Empty;
var u, v, client, folder, list, names, character, missing, week, first, last, first_time, last_time, hours;
var ini, key, output, secret, grid, position, pdf;

function Say(name, value) { WScript.Echo(name + "=" + (value === true ? "True" : value)); }
function SayError(name, e) { Say(name, (e.number & 65535) + " " + e.description); }
function CreateObject(name) { return new ActiveXObject(name); }
function Asc(text) { return text.charCodeAt(0); }
function Chr(code) { return String.fromCharCode(code); }
function Left(text, count) { return text.substr(0, count); }
function Mid(text, start, count) { return text.substr(start - 1, count); }
function Len(text) { return text.length; }
function InStr(text, part) { return text.indexOf(part) + 1; }
function Year(date) { return new Date(date).getFullYear(); }
function Month(date) { return new Date(date).getMonth() + 1; }
function DateSerial(year, month, day) { return day + "/" + month + "/" + year; }
function TimeSerial(hour, minute, second) { return hour + ":0" + minute; }

// The members that combo boxes and grids are driven by. A property with an index can be read, but not put.
function HostControl() {
  this.Text = "typed";
  this.ListCount = 3;
  this.Cols = 3;
  this.ItemData = function (index) { return index === 0 ? 7 : 12; };
  this.ColWidth = function (column) { return column === 2 ? 1000 : 480 * column; };
}

function use_own_objects() {
  var control = new HostControl(), table = new ActiveXObject("TALUtil.Grid"), variable;
  client = WScript.Arguments(0);
  u = new ActiveXObject("TALUtil.ORVUtils");
  u.sDatabaseName = "Clients";
  u.sUserName = client;
  Say("combo", u.GetComboListIndex(control, 12));
  Say("combo.text", "[" + control.Text + "]");
  u.SaveGridWidths(control, client, 1);
  table.Cols = 3;
  table.ColWidth(0) = 0;
  u.LoadGridWidths(table, client, 1);
  Say("widths.own", table.ColWidth(0) + " " + table.ColWidth(1) + " " + table.ColWidth(2));
  u.ReadCommaDelimStrToList("red,", variable);
  Say("list.variable", variable);
  try { u.IndexInList(["Apple", "Banana"], "ban"); } catch (e) { SayError("error.list", e); }
}
use_own_objects();
