// XObjectInspector from JScript over the sample harbour scene: what a script can reach
// without a window (FormatAttributes, DataSet, SetInfo refused before the window). Wine's
// cscript exits 0 after a script error: everything runs inside try, the exit status comes
// from the checks.
var failures = 0;
function check(ok, what) {
  if (!ok) {
    WScript.Echo("FAILED: " + what);
    failures++;
  }
}
function fails(call) {
  try {
    call();
  } catch (e) {
    return e.number;
  }
  return 0;
}
try {
  var fso = new ActiveXObject("Scripting.FileSystemObject");
  var root = fso.GetParentFolderName(fso.GetParentFolderName(fso.GetParentFolderName(
      fso.GetParentFolderName(WScript.ScriptFullName))));
  var scene = new ActiveXObject("ChartScene.Scene");
  scene.Load(fso.BuildPath(root, "data\\harbour\\harbour.json"));
  var inspector = new ActiveXObject("BR_Info.XObjectInspector");
  var brest = scene.Database("BREST");
  var id = scene.ObjectId(scene.Object("fillettes-rock"));

  var text = inspector.FormatAttributes(brest, id);
  // The rock's attributes as name and value lines, without the heading.
  var expected = ["Value of sounding", "1.8", "Water level effect", "always under water/submerged",
                  "Quality of sounding measurement", "least depth known"];
  check(text == expected.join("\r"), "attribute lines: " + text.replace(/\r/g, " / "));
  check(fails(function () { inspector.FormatAttributes(brest, "BR_Info.XObjectInspector"); }) == 0x80070057 - 0x100000000,
        "a program identifier is no GUID");
  check(fails(function () { inspector.FormatAttributes(brest, id.toLowerCase().substr(1)); }) != 0,
        "a GUID without braces");
  check(inspector.DataSet === null, "no records, no dataset");
  var records = scene.ObjectRecords("fillettes-rock");
  check(fails(function () { inspector.SetInfo(records); }) == 0x80040007 - 0x100000000, "no window, no tree");
} catch (e) {
  check(false, "script error " + e.number + ": " + e.description);
}
if (failures == 0) WScript.Echo("script completed");
WScript.Quit(failures == 0 ? 0 : 1);
