// Runs examples/chart-scene.js as a user would and checks what it printed against the
// sample scene file. Wine's cscript exits 0 after a script error: everything runs inside
// try, the exit status comes from the checks.
var failures = 0;
function check(ok, what) {
  if (!ok) {
    WScript.Echo("FAILED: " + what);
    failures++;
  }
}
var fso = new ActiveXObject("Scripting.FileSystemObject");
var shell = new ActiveXObject("WScript.Shell");
function capture(commandLine) {
  var file = fso.BuildPath(fso.GetSpecialFolder(2), fso.GetTempName());
  var status = shell.Run("cmd /c \"" + commandLine + " > \"" + file + "\"\"", 0, true);
  var stream = fso.OpenTextFile(file, 1), text = stream.AtEndOfStream ? "" : stream.ReadAll();
  stream.Close();
  fso.DeleteFile(file);
  return {status: status, lines: text.replace(/\r/g, "").split("\n")};
}
function has(lines, line) {
  for (var i = 0; i < lines.length; i++) if (lines[i] == line) return true;
  return false;
}
try {
  var root = fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(
      fso.GetParentFolderName(WScript.ScriptFullName))));
  var example = fso.BuildPath(root, "examples\\chart-scene.js");
  var run = capture("cscript //nologo \"" + example + "\"");
  check(run.status == 0, "the example exits 0, got " + run.status);
  var out = run.lines;
  // Header fields as harbour.json gives them, decoded from the header record's bytes.
  var expected = ["  file name: FR5BR010.000", "  edition: 3", "  update: 2", "  update date: 2023-05-02",
                  "  issue date: 2022-11-15", "  scale: 22000", "  level: 5", "  producing agency: 170",
                  "  source id: SHOM 7401", "  status: 2", "  usage: 5"];
  for (var i = 0; i < expected.length; i++) check(has(out, expected[i]), "header line " + expected[i]);
  // Attributes with their S-57 names and enumeration texts from gdal-data's catalogue.
  var attributes = ["  Light characteristic (107) = isophased", "  Signal group (141) = (2)",
                    "  Signal period (142) = 6", "  Colour (75) = white", "  Sector limit one (136) = 50",
                    "  Sector limit two (137) = 70.5", "  Category of light (37) = directional function",
                    "  Status (149) = permanent", "  Information (102) = Leading light 068.5|in the white sector"];
  for (var k = 0; k < attributes.length; k++) check(has(out, attributes[k]), "attribute line " + attributes[k]);
  check(/^object minou-light-white \{00000002-0000-0000-4652-354252303130\} attributes:$/.test(out[14]),
        "identity line: " + out[14]);
  check(has(out, "object records: 2"), "records line");

  // A scene with a fault is refused with its place, and the script says so.
  var bad = fso.BuildPath(fso.GetSpecialFolder(2), fso.GetTempName() + ".json");
  var stream = fso.CreateTextFile(bad, true);
  stream.Write("{\"format\": \"chartscene 1\",\n \"databases\": [{\"name\": \"X\", \"kind\": \"charts\", \"datasets\": []}]}");
  stream.Close();
  var refused = capture("cscript //nologo \"" + example + "\" \"" + bad + "\"");
  fso.DeleteFile(bad);
  check(refused.status == 1, "a refused scene exits 1, got " + refused.status);
  check(refused.lines[0] == "cannot load " + bad + ": line 2, column 38: a database kind is chart, user or hierarchy",
        "refusal line: " + refused.lines[0]);
} catch (e) {
  check(false, "script error " + (e.number >>> 0).toString(16) + " " + e.message);
}
WScript.Echo("script completed");
WScript.Quit(failures == 0 ? 0 : 1);
