// What client.vbs does, in JScript.
//
//   cscript //nologo client.js CLIENT
//
// Nothing that a call writes back reaches a variable here, and an array of JScript is an object, not a list.
var client = WScript.Arguments(0);
var folder = "C:\\clients\\" + client + "\\";
var pdf = "C:\\TAL\\ORV3\\DATA\\MONTHLYREPORTS\\SalesReport.pdf";
var key = "Software\\TALUtil Clients\\" + client;
var u = new ActiveXObject("TALUtil.ORVUtils");

function say(name, value) {
  WScript.Echo(name + "=" + (value === true ? "True" : value));
}

function say_error(name, step) {
  try {
    step();
    say(name, "no error");
  } catch (e) {
    say(name, (e.number & 65535) + " " + e.description);
  }
}

// The members that combo boxes and grids are driven by. A property with an index can be read, but not put.
function HostControl() {
  this.Text = "typed";
  this.ListCount = 3;
  this.Cols = 3;
  this.ItemData = function (index) { return index === 0 ? 7 : 12; };
  this.ColWidth = function (column) { return column === 2 ? 1000 : 480 * column; };
}

function texts_and_lists() {
  var list, character = "";
  say("text", u.VerifyTextData(20, 1, "  Smith & \"Sons\", Pty #1  "));
  say("text.apostrophe", u.VerifyTextData(0, 0, "O'Brien").charCodeAt(1));
  say("number", u.VerifyIntData(0, "3.50kg"));
  say("number.null", u.VerifyIntData(1, null));
  u.iCharactercase = 1;
  say("case", u.ConvertCase(0, "MARY SMITH-JONES"));
  say("list", u.ReadCommaDelimStrToList("red,green,blue,", list));
  say("list.items", list);
  say_error("list.index", function () { u.IndexInList(["Apple", "Banana"], "ban"); });
  say("field", u.GetData("A,B,C,", 1, 2));
  say("blanks", u.RemoveStringsFromNumber(2, "A B", character));
  say("blanks.back", "[" + character + "]");
}

function dates_and_durations() {
  var missing = "00:00:00", week = 60, hours = " 1.5 ";
  say("date", new Date(u.VerifyNullDate(0, missing)).getFullYear());
  say("date.back", missing);
  say("month", u.IncMonth("31/1/2009", 1));
  say("week", u.GetWeekNumber("31/12/2009"));
  say("week.start", new Date(u.WeekYearToDate(week, 2009, 1)).getMonth() + 1);
  say("week.back", week);
  say("difference", u.GetTimeDifference("10/3/2024", "11/3/2024", "22:00", "2:00"));
  say("duration", u.DateTimeToDuration("2/1/1800 02:00"));
  say("duration.number", u.ConvertDurationToNumber("01:45"));
  say("duration.minutes", u.ConvertDatabaseDurationToMinutes(u.DurToTime(hours)));
  say("duration.back", "[" + hours + "]");
}

function settings_and_files() {
  u.sDatabaseName = "Clients";
  u.sUserName = client;
  u.VerifyFilePath(folder + "in\\");
  u.SaveCfgFileData("Branch", "Name", "north", folder + "client.ini", true);
  say("setting", u.GetCfgFileData("branch", "name", "none", folder + "client.ini", true));
  u.SaveCfgFileData(client, "Name", "stored", "any");
  say("setting.store", u.GetCfgFileData(client, "Name", "none", "any"));
  u.REGISTRY_CreateNewKey(key, 0x80000001 | 0);
  u.REGISTRY_SetKeyValue(key, "Number", 42, 4);
  say("registry", u.REGISTRY_ReturnValue(key, "Number"));
  u.SaveTextBox("a line", folder + "in\\a.txt");
  u.SaveTextBox(u.CryptoEncryptString("branch 12"), folder + "in\\b.txt");
  say("files", u.GetFileList(",", folder + "in\\", "*.txt"));
  u.CallZIPFiles(folder + "a.zip", folder + "in", 0, "");
  u.CallUnZIPFiles(folder + "a.zip", folder + "out\\", "");
  say("zip", u.LoadTextBox(folder + "out\\in\\a.txt").substr(0, 6));
  say("secret", u.CryptoDecryptString(u.LoadTextBox(folder + "out\\in\\b.txt").replace("\r\n", "")));
  u.sORVPath = folder;
  u.EventLog = 1;
  u.AppendEventLog("Saved", "frmBooking");
  say("log", u.LoadTextBox(folder + "EventLog.txt").indexOf(":Saved:frmBooking") > 0);
}

function controls() {
  var control = new HostControl(), grid = new ActiveXObject("TALUtil.Grid");
  var position = new ActiveXObject("TALUtil.cControlPosition");
  say("combo", u.GetComboListIndex(control, 12));
  say("combo.text", "[" + control.Text + "]");
  u.SaveGridWidths(control, client, 1);
  grid.Cols = 3;
  grid.ColWidth(0) = 0;
  u.LoadGridWidths(grid, client, 1);
  say("widths", grid.ColWidth(0) + " " + grid.ColWidth(1) + " " + grid.ColWidth(2));
  position.ControlName = client;
  position.left = 120;
  position.SaveControlPosition();
  position.left = 0;
  position.GetControlPosition();
  say("position", position.left);
}

function report() {
  var grid = new ActiveXObject("TALUtil.Grid");
  u.DeleteFiles(pdf);
  grid.Cols = 2;
  grid.AddItem("Job\tDone");
  grid.FixedRows = 1;
  grid.AddItem("1001\tTrue");
  grid.ColDataType(1) = 11;
  say("ticks", u.CountGridSelectedRows(1, grid));
  u.AutomatedEndOfMonth = true;
  u.GridPrintPreview(100, 2, "Sales", "", grid, "1/3/2009", "31/3/2009", "SalesReport");
  say("report", u.LoadTextBox(pdf).substr(0, 5));
}

texts_and_lists();
dates_and_durations();
settings_and_files();
controls();
report();
say_error("error.overflow", function () { u.IncWeek("5/3/2009", 4682); });
say_error("error.object", function () { u.DrawTextPictureBox = "a text"; });
say_error("error.own", function () { u.CryptoDecryptString("QUJD"); });
u.Terminate();
say("done", true);
