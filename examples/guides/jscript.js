// TALUtil from JScript: cscript //nologo jscript.js
var u = new ActiveXObject("TALUtil.ORVUtils");
WScript.Echo(u.VerifyTextData(20, 1, "  Smith & Sons, Pty  "));

// Variables go to a call by value, so a list that it fills is lost. Walk the text instead: GetData returns what stands
// between two commas.
function elements(text) {
  var list = [], count = u.SubStrCount(",", text);
  for (var i = 0; i < count; ++i) list.push(u.GetData(text, i, i + 1));
  return list;
}
WScript.Echo(elements("red,green,blue,").join(" | "));

// An array of JScript is an object. The items of a dictionary are the array that members take.
function automation_array(list) {
  var items = new ActiveXObject("Scripting.Dictionary");
  for (var i = 0; i < list.length; ++i) items.Add(i, list[i]);
  return items.Items();
}
WScript.Echo(u.IndexInList(automation_array(["Apple", "Banana"]), "ban"));

// An array that is a result arrives as a VBArray.
var addresses = new VBArray(u.GetIpAddrTable()).toArray();
WScript.Echo(addresses instanceof Array ? "an array of addresses" : "no array");

// A corrected argument is lost, too: ask for the value in another way, here by the date that belongs to the week.
WScript.Echo(u.GetWeekNumber(u.WeekYearToDate(60, 2009, 1)));

try {
  u.GetWeekNumber("tomorrow");
} catch (error) {
  WScript.Echo("error " + (error.number & 0xFFFF) + ": " + error.description);
}
u.Terminate();
