// TidesPort as a JScript client sees it: null for no port, a day-count date and refusals
// as exceptions. (Sun times and whole days: tides_example_check.js; the day's rules: the
// tides_port suite.)
var failures = 0;
function check(condition, what) {
  if (!condition) {
    WScript.Echo("FAILED: " + what);
    failures++;
  }
}

var fso = new ActiveXObject("Scripting.FileSystemObject");
var root = fso.GetParentFolderName(WScript.ScriptFullName);
root = fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(root)));
var db = new ActiveXObject("BR_Info.TidesDatabase");
db.Initialize(fso.BuildPath(root, "data\\world"));
var count = db.NumPorts;
check(count > 100, "station count " + count);
check(db.GetPort(-1) == null, "no port before the first station");
check(db.GetPort(count) == null, "no port after the last station");

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
try {
  port.WavePoint(25);
  check(false, "WavePoint(25) is refused");
} catch (e) {
  // E_INVALIDARG on Windows; Wine's JScript reports DISP_E_MEMBERNOTFOUND.
  var code = e.number >>> 0;
  check(code == 0x80070057 || code == 0x80020003, "WavePoint(25) is refused, got " + code.toString(16));
}

if (failures == 0) WScript.Echo("ok: " + count + " stations, day of " + port.PortName);
WScript.Echo("script completed");
WScript.Quit(failures);
