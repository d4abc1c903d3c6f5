// What JScript does in its own way and the guides do not show: variables that a call would change, arrays, dates, and
// controls whose properties with an index are functions, which can be read but not put. Each check that fails is a
// line; the last line is "N passed, N failed".
//
//   cscript //nologo client.js
var u = new ActiveXObject("TALUtil.ORVUtils"), passed = 0, failed = 0;

function check(name, expected, actual) {
  if (expected === actual) return ++passed;
  ++failed;
  WScript.Echo("FAILED " + name + ": expected " + expected + ", got " + actual);
}

function error_of(work) {
  try { work(); } catch (error) { return (error.number & 0xFFFF) + " " + error.description; }
}

var list, week = 60;
check("a list", 3, u.ReadCommaDelimStrToList("red,green,blue,", list));
check("its variable", undefined, list);
check("the month of a date", 12, new Date(u.WeekYearToDate(week, 2009, 1)).getMonth() + 1);
check("the week", 60, week);
check("Null", "0", u.VerifyIntData(1, null));
check("an array", "13 Type mismatch", error_of(function () { u.IndexInList(["Apple", "Banana"], "ban"); }));
check("no cipher text", "5 This is not a cipher text of this library, or it was changed",
      error_of(function () { u.CryptoDecryptString("QUJD"); }));

var control = {
  Text: "typed", ListCount: 3, Cols: 3,
  ItemData: function (index) { return index === 0 ? 7 : 12; },
  ColWidth: function (column) { return column === 2 ? 1000 : 480 * column; }
};
check("a key", 1, u.GetComboListIndex(control, 12));
check("the text after that", "", control.Text);
var table = new ActiveXObject("TALUtil.Grid");
u.sDatabaseName = "Clients";
u.SaveGridWidths(control, "JScript", 1);
table.Cols = 3;
table.ColWidth(0) = 0;
u.LoadGridWidths(table, "JScript", 1);
check("widths", "0 480 1000", table.ColWidth(0) + " " + table.ColWidth(1) + " " + table.ColWidth(2));
u.Terminate();
WScript.Echo(passed + " passed, " + failed + " failed");
