// TidesPort as a JScript client sees it: null for no port, a day-count date and refusals
// as exceptions.
var failures = 0;
function check(condition, what) {
  if (!condition) WScript.Echo("FAILED: " + what), failures++;
}
var fso = new ActiveXObject("Scripting.FileSystemObject");
var root = fso.GetParentFolderName(WScript.ScriptFullName);
root = fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(root))));
var db = new ActiveXObject("BR_Info.TidesDatabase");
db.Initialize(fso.BuildPath(root, "data\\world"));
check(db.GetPort(db.NumPorts) == null, "no port after the last station");

var port = db.GetPort(0);
try {
  port.MaxValue;
  check(false, "MaxValue without points is refused");
} catch (e) {
  check((e.number >>> 0) == 0x80070005, "E_ACCESSDENIED without points");
}
port.Calculate(1, 36526.75);  // 2000-01-01, the fraction is dropped
check(port.NumPoints == 25, "25 points for a step of one hour, got " + port.NumPoints);
check(port.PredictionDate == 36526, "the whole day as a number, got " + port.PredictionDate);
WScript.Echo("script completed");
WScript.Quit(failures);
