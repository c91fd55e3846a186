// The stand-in chart host from JScript: load the sample harbour scene, print a dataset's
// header fields and an object's attributes, both read through the chart data interfaces
// that BR_Info reads (the scene's ChartScene object does the reading for the script).
//   cscript //nologo chart-scene.js [scene file] [dataset id] [object name]
var fso = new ActiveXObject("Scripting.FileSystemObject");
var root = fso.GetParentFolderName(fso.GetParentFolderName(WScript.ScriptFullName));
var args = WScript.Arguments;
var file = args.length > 0 ? args(0) : fso.BuildPath(root, "data\\harbour\\harbour.json");
var datasetId = args.length > 1 ? args(1) : "FR5BR010";
var objectName = args.length > 2 ? args(2) : "minou-light-white";

var scene = new ActiveXObject("ChartScene.Scene");
try {
  scene.Load(file);
} catch (e) {
  WScript.Echo("cannot load " + file + ": " + scene.LastError);
  WScript.Quit(1);
}
WScript.Echo("scene " + file);

// A dataset comes out as a plain interface pointer: JScript cannot call it, but it can
// hand it back to the scene, and to BR_Info's controls.
var dataset = scene.DataSet(datasetId);
WScript.Echo("dataset " + datasetId + " header:");
var header = scene.HeaderText(dataset).split("\n");
for (var i = 0; i < header.length; i++) if (header[i]) WScript.Echo("  " + header[i]);

var object = scene.Object(objectName);
WScript.Echo("object " + objectName + " " + scene.ObjectId(object) + " attributes:");
var attributes = scene.AttributeText(object).split("\n");
for (var k = 0; k < attributes.length; k++) if (attributes[k]) WScript.Echo("  " + attributes[k]);

// What the inspector would be given for these two objects: one record each.
var records = scene.ObjectRecords(objectName + ", fillettes-beacon");
WScript.Echo("object records: " + (records === undefined ? "none" : "2"));
