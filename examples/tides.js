// The tide road from JScript: open the world station set, look at a box, find Brest,
// calculate a day's tides (today's unless a date is given) and read the extremes, sun
// times and every point.
//   cscript //nologo tides.js [station folder [YYYY-MM-DD]]
// Wine's cscript says nothing about an error the script does not catch: every error is
// caught here, printed with its code, and ends the script with exit status 1.
try {
  var fso = new ActiveXObject("Scripting.FileSystemObject");
  var root = fso.GetParentFolderName(fso.GetParentFolderName(WScript.ScriptFullName));
  var folder = WScript.Arguments.length > 0 ? WScript.Arguments(0) : fso.BuildPath(root, "data\\world");
  var db = new ActiveXObject("BR_Info.TidesDatabase");
  db.Initialize(folder);
  WScript.Echo(db.NumPorts + " stations in " + folder);

  // GetPorts gives an array of TidesPort objects, or nothing for an empty box. JScript reads
  // only arrays of Variants, so it can tell the two apart but not look inside.
  var box = db.GetPorts(47.5, -6, 49.5, -3);
  WScript.Echo("47.5N 6W to 49.5N 3W: " + (box === undefined ? "no station" : "stations"));

  for (var i = 0, port = null; i < db.NumPorts && !port; i++) {
    var candidate = db.GetPort(i);
    if (candidate.PortName == "Brest") port = candidate;
  }
  if (!port) throw new Error("no station named Brest in " + folder);
  var clock = function (days) {  // days after midnight as hh:mm
    var m = Math.round(days * 1440);
    return ("0" + Math.floor(m / 60)).slice(-2) + ":" + ("0" + m % 60).slice(-2);
  };
  var now = new Date(), day = [now.getFullYear(), now.getMonth() + 1, now.getDate()];
  if (WScript.Arguments.length > 1) {
    day = WScript.Arguments(1).split("-");
    if (day.length != 3 || isNaN(Date.UTC(day[0], day[1] - 1, day[2]))) throw new Error("the date wants YYYY-MM-DD");
  }
  // The day as a day-count date: days since 1899-12-30.
  port.Calculate(1, (Date.UTC(day[0], day[1] - 1, day[2]) - Date.UTC(1899, 11, 30)) / 864e5);
  var d = port.PredictionDate;  // one point an hour, 00:00 to 24:00 local standard time
  WScript.Echo(port.PortName + ", zone " + port.TimeZone + ": sunrise " + clock(port.SunRise - d) + ", sunset " +
               clock(port.SunSet - d) + ", twilight " + clock(port.BeginTwilight - d) + " to " + clock(port.EndTwilight - d));
  WScript.Echo("highest " + port.MaxValue.toFixed(3) + " m at " + clock(port.MaxValueIndex * port.Step / 24) +
               ", lowest " + port.MinValue.toFixed(3) + " m at " + clock(port.MinValueIndex * port.Step / 24));
  for (var k = 0; k < port.NumPoints; k++) {
    WScript.Echo("  " + clock(k * port.Step / 24) + "  " + port.WavePoint(k).toFixed(3));
  }
} catch (e) {
  // COM errors carry an HRESULT (0x80070057: the folder is not a station folder).
  WScript.Echo("tides.js: " + (e.number ? "error 0x" + (e.number >>> 0).toString(16) + ": " : "") + e.message);
  WScript.Quit(1);
}
