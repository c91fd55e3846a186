// XChartLegend from JScript: load the sample harbour scene into the stand-in chart host,
// give the legend a dataset, the chart display's projection and a position, and print its
// seventeen properties.
//   cscript //nologo legend.js [dataset id] [latitude] [longitude] [scene file]
// The producing agency shows by name when the registry's KeyPath (HKLM\SOFTWARE\Brine\
// Brdata\Enum) names a folder holding SYSTEM\HTML\hosource.txt (the build makes one from
// gdal-data's agency list in <build>\agencies\); otherwise by its code.
var fso = new ActiveXObject("Scripting.FileSystemObject");
var root = fso.GetParentFolderName(fso.GetParentFolderName(WScript.ScriptFullName));
var args = WScript.Arguments;
var datasetId = args.length > 0 ? args(0) : "FR5BR010";
var latitude = args.length > 1 ? parseFloat(args(1)) : 48.35;
var longitude = args.length > 2 ? parseFloat(args(2)) : -4.55;
var file = args.length > 3 ? args(3) : fso.BuildPath(root, "data\\harbour\\harbour.json");

var scene = new ActiveXObject("ChartScene.Scene");
try {
  scene.Load(file);
} catch (e) {
  WScript.Echo("cannot load " + file + ": " + scene.LastError);
  WScript.Quit(1);
}

var legend = new ActiveXObject("BR_Info.XChartLegend");
// Positions go in as 1e-7 degree.
legend.SetLegendData(scene.DataSet(datasetId), scene.Projection("chart"),
                     Math.round(latitude * 1e7), Math.round(longitude * 1e7));

var NO_VALUE = 1.7976931348623157e308;
function number(value) { return value == NO_VALUE ? "<None>" : String(Math.round(value * 1000) / 1000); }
function date(value) {
  // Dates come as automation dates; "no value" does not convert to one.
  try {
    var d = new Date(value);
    if (isNaN(d.getTime())) return "<None>";
    function two(n) { return (n < 10 ? "0" : "") + n; }
    return d.getUTCFullYear() + "-" + two(d.getUTCMonth() + 1) + "-" + two(d.getUTCDate());
  } catch (e) {
    return "<None>";
  }
}

WScript.Echo("legend of " + datasetId + " at " + latitude + ", " + longitude);
WScript.Echo("  DepthUnits: " + legend.DepthUnits);
WScript.Echo("  HeightUnits: " + legend.HeightUnits);
WScript.Echo("  SoundingDatum: " + legend.SoundingDatum);
WScript.Echo("  VerticalDatum: " + legend.VerticalDatum);
WScript.Echo("  HorizontalDatum: " + legend.HorizontalDatum);
WScript.Echo("  EditionDate: " + date(legend.EditionDate));
WScript.Echo("  UpdateDate: " + date(legend.UpdateDate));
WScript.Echo("  EditionNumber: " + legend.EditionNumber);
WScript.Echo("  UpdateNumber: " + legend.UpdateNumber);
WScript.Echo("  SourceIDCode: " + legend.SourceIDCode);
WScript.Echo("  BathymetricQuality: " + legend.BathymetricQuality);
WScript.Echo("  NonBathymetricQuality: " + number(legend.NonBathymetricQuality));
WScript.Echo("  DefaultScale: " + legend.DefaultScale);
WScript.Echo("  Projection: " + legend.Projection);
WScript.Echo("  MagneticVariation: " + number(legend.MagneticVariation));
WScript.Echo("  SourceProducingAgency: " + legend.SourceProducingAgency);
