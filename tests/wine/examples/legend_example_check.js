// Runs examples/legend.js as a user would, with KeyPath naming the agency table the build
// made, and checks the seventeen properties it prints for the sample scene's vector and
// raster datasets. Wine's cscript exits 0 after a script error: everything runs inside
// try, the exit status comes from the checks, and the last line says the script ran through.
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
function expect(lines, expected) {
  for (var i = 0; i < expected.length; i++) {
    check(lines[i + 1] == "  " + expected[i], "line " + (i + 1) + ": expected '" + expected[i] + "', got '" +
          lines[i + 1] + "'");
  }
}
var keyPath = "HKLM\\SOFTWARE\\Brine\\Brdata\\Enum\\KeyPath";
var earlier = null;
try {
  try { earlier = shell.RegRead(keyPath); } catch (e) { earlier = null; }
  var build = shell.ExpandEnvironmentStrings("%BR_WIN64_DIR%");
  // Wine's answer carries its terminator: cut the text there.
  var end = build.indexOf(String.fromCharCode(0));
  if (end >= 0) build = build.substring(0, end);
  shell.RegWrite(keyPath, "Z:" + build.replace(/\//g, "\\") + "\\agencies\\", "REG_SZ");
  var root = fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(
      fso.GetParentFolderName(WScript.ScriptFullName))));
  var example = fso.BuildPath(root, "examples\\legend.js");
  var year = new Date().getUTCFullYear();
  var variation = String(Math.round((-1.5 + 7 / 60 * (year - 2020)) * 1000) / 1000);

  var run = capture("cscript //nologo \"" + example + "\"");
  check(run.status == 0, "the example exits 0, got " + run.status);
  check(run.lines[0] == "legend of FR5BR010 at 48.35, -4.55", "first line: " + run.lines[0]);
  var france = "Service Hydrographique et Oceanographique de la Marine, France";
  expect(run.lines, ["DepthUnits: Meters", "HeightUnits: Meters", "SoundingDatum: Lowest astronomical tide",
                     "VerticalDatum: Mean sea level", "HorizontalDatum: WGS 84", "EditionDate: 2022-11-15",
                     "UpdateDate: 2023-05-02", "EditionNumber: 3", "UpdateNumber: 2", "SourceIDCode: SHOM 7401",
                     "BathymetricQuality: zone of confidence A2", "NonBathymetricQuality: 2.5",
                     "DefaultScale: 22000", "Projection: MERCATOR", "MagneticVariation: " + variation,
                     "SourceProducingAgency: " + france]);

  var raster = capture("cscript //nologo \"" + example + "\" FR3BR001");
  expect(raster.lines, ["DepthUnits: metres", "HeightUnits: metres", "SoundingDatum: Lowest astronomical tide",
                        "VerticalDatum: Mean sea level", "HorizontalDatum: WGS 84", "EditionDate: 2021-06-15",
                        "UpdateDate: 2023-03-01", "EditionNumber: -1", "UpdateNumber: -1", "SourceIDCode: FR",
                        "BathymetricQuality: ", "NonBathymetricQuality: <None>", "DefaultScale: 50000",
                        "Projection: MERCATOR", "MagneticVariation: <None>", "SourceProducingAgency: " + france]);
} catch (e) {
  check(false, "script error: " + e.message);
}
try {
  // Wine's RegDelete leaves a value in place: reg.exe removes it.
  if (earlier === null) shell.Run("reg delete \"HKLM\\SOFTWARE\\Brine\\Brdata\\Enum\" /v KeyPath /f", 0, true);
  else shell.RegWrite(keyPath, earlier, "REG_SZ");
} catch (e) {
}
WScript.Echo("script completed");
WScript.Quit(failures == 0 ? 0 : 1);
