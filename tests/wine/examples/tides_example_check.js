// Runs examples/tides.js as a user would (cscript, output captured) and checks what it printed
// against Brest's day read here through COM and against brtide's CSV of that day. Wine's cscript
// exits 0 after a script error: everything runs inside try, the exit status comes from the checks.
var failures = 0;
function check(ok, what) {
  if (!ok) {
    WScript.Echo("FAILED: " + what);
    failures++;
  }
}
var fso = new ActiveXObject("Scripting.FileSystemObject");
var shell = new ActiveXObject("WScript.Shell");
// Output of a command line, through a scratch file (Wine has no WScript.Shell.Exec).
function capture(commandLine) {
  var file = fso.BuildPath(fso.GetSpecialFolder(2), fso.GetTempName());
  // cmd drops the first and last quote of what follows /c: the outer pair is for it.
  var status = shell.Run("cmd /c \"" + commandLine + " > \"" + file + "\"\"", 0, true);
  var stream = fso.OpenTextFile(file, 1), text = stream.AtEndOfStream ? "" : stream.ReadAll();
  stream.Close();
  fso.DeleteFile(file);
  return {status: status, lines: text.replace(/\r/g, "").split("\n")};
}
function clock(days) {
  var m = Math.round(days * 1440);
  return ("0" + Math.floor(m / 60)).slice(-2) + ":" + ("0" + m % 60).slice(-2);
}
try {
  var root = fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(
      fso.GetParentFolderName(WScript.ScriptFullName))));
  var folder = fso.BuildPath(root, "data\\world");
  var script = "cscript //nologo \"" + fso.BuildPath(root, "examples\\tides.js") + "\"";
  var example = capture(script);
  check(example.status == 0, "the example exits 0, got " + example.status);
  var out = example.lines;

  var db = new ActiveXObject("BR_Info.TidesDatabase");
  db.Initialize(folder);
  check(out[0] == db.NumPorts + " stations in " + folder, "count line: " + out[0]);
  check(out[1] == "47.5N 6W to 49.5N 3W: stations", "box line: " + out[1]);
  check(db.GetPorts(40, -40, 41, -39) === undefined, "an open-ocean box holds no station");

  var number = -1;
  for (var i = 0; i < db.NumPorts && number < 0; i++) {
    if (db.GetPort(i).PortName == "Brest") number = i;
  }
  check(number >= 0, "Brest is in the world set");
  var port = db.GetPort(number);
  var now = new Date();
  var today = (Date.UTC(now.getFullYear(), now.getMonth(), now.getDate()) - Date.UTC(1899, 11, 30)) / 864e5;
  port.Calculate(1, today);
  check(port.NumPoints == 25, "25 points, got " + port.NumPoints);
  check(port.TimeZone == -1, "Brest keeps zone -1 (UTC+1), got " + port.TimeZone);
  check(port.MaxValue - port.MinValue > 1.5, "Brest's day spans more than 1.5 m");
  var d = port.PredictionDate;
  check(d == today, "prediction date " + d);
  check(out[2] == "Brest, zone -1: sunrise " + clock(port.SunRise - d) + ", sunset " + clock(port.SunSet - d) +
                      ", twilight " + clock(port.BeginTwilight - d) + " to " + clock(port.EndTwilight - d),
        "sun line: " + out[2]);
  check(out[3] == "highest " + port.MaxValue.toFixed(3) + " m at " + clock(port.MaxValueIndex / 24) + ", lowest " +
                      port.MinValue.toFixed(3) + " m at " + clock(port.MinValueIndex / 24),
        "extremes line: " + out[3]);
  check(out[4 + 24] == "  24:00  " + port.WavePoint(24).toFixed(3), "last point line: " + out[28]);

  // An error is caught and printed with its code, and the script exits 1 (Wine's cscript
  // would print nothing and exit 0).
  var failed = capture(script + " \"" + fso.BuildPath(root, "no such folder") + "\"");
  check(failed.status == 1, "a bad folder: exit status 1, got " + failed.status);
  check(failed.lines[0].indexOf("tides.js: error 0x80070057: ") == 0, "a bad folder: " + failed.lines[0]);

  // brtide, the C++ client, prints the same heights for the same station and day.
  var brtide = "Z:" + shell.Environment("PROCESS")("BR_WIN64_DIR").replace(/\//g, "\\") + "\\host\\brtide\\brtide.exe";
  var iso = now.getFullYear() + "-" + ("0" + (now.getMonth() + 1)).slice(-2) + "-" + ("0" + now.getDate()).slice(-2);
  var csv = capture("\"" + brtide + "\" day --folder \"" + folder + "\" --port " + number + " --date " + iso + " --csv");
  check(csv.status == 0, "brtide exits 0, got " + csv.status);
  check(csv.lines[0] == "time,height_m,event", "CSV header: " + csv.lines[0]);
  var points = [];  // the rows without an event (high and low waters and the sun have one)
  for (var i = 1; i < csv.lines.length; i++) {
    var cells = csv.lines[i].split(",");
    if (cells.length == 3 && cells[2] == "") points.push(cells);
  }
  check(points.length == 25, "25 points in brtide's CSV, got " + points.length);
  for (var k = 0; k < 25; k++) {
    var example_point = out[4 + k].replace(/^ +/, "").split(/ +/);
    var row = points[k] || [];
    check(example_point[0] == clock(k / 24), "example point " + k + " time " + example_point[0]);
    check(example_point[1] == port.WavePoint(k).toFixed(3), "example point " + k + ": " + example_point[1]);
    check(row[1] == example_point[1], "brtide point " + k + ": " + row[1] + " against " + example_point[1]);
  }
} catch (e) {
  check(false, "script error " + (e.number >>> 0).toString(16) + " " + e.message);
}
WScript.Echo("script completed");
WScript.Quit(failures == 0 ? 0 : 1);
