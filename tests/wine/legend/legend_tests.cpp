// XChartLegend from a C++ client over the stand-in chart host: every property after a fill
// of the sample scene and of scenes written here, the defaults, the cache (the host's call
// counters), near and far magnetic variation objects, the raster dataset, a missing
// geodesy library, and failures through the reporter's log and box.
#include "tests/wine/common/BoxPresser.h"
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/SceneClient.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/registry_test_support.h"

#include "BR_Info.h"
#include "GeoData.h"

#include <doctest/doctest.h>

#include <cfloat>
#include <cmath>
#include <string>

using namespace br::test;

namespace {

constexpr double kNoValue = DBL_MAX;

std::wstring Wide(const std::string& text) { return std::wstring(text.begin(), text.end()); }

int CurrentYear() {
  SYSTEMTIME now{};
  GetSystemTime(&now);
  return now.wYear;
}

double Date(int year, int month, int day) {
  SYSTEMTIME time{};
  time.wYear = static_cast<WORD>(year);
  time.wMonth = static_cast<WORD>(month);
  time.wDay = static_cast<WORD>(day);
  double date = 0.0;
  SystemTimeToVariantTime(&time, &date);
  return date;
}

// Positions in the unit GeoToPixel takes: 1e-7 degree.
long Unit(double degrees) { return static_cast<long>(std::lround(degrees * 1e7)); }

// Every property as the host reads it.
struct Legend {
  std::string depthUnits, heightUnits, soundingDatum, verticalDatum, horizontalDatum;
  double editionDate = 0, updateDate = 0;
  long editionNumber = 0, updateNumber = 0;
  std::string sourceIdCode, bathymetricQuality;
  double nonBathymetricQuality = 0;
  long defaultScale = 0;
  std::string projection;
  double magneticVariation = 0;
  HRESULT variationResult = E_FAIL;
  std::string sourceProducingAgency;
};

std::string Text(IXChartLegend* legend, HRESULT (STDMETHODCALLTYPE IXChartLegend::*get)(BSTR*)) {
  BSTR text = nullptr;
  REQUIRE((legend->*get)(&text) == S_OK);
  std::string result;
  for (const wchar_t* c = text; c && *c; ++c) result += static_cast<char>(*c);
  SysFreeString(text);
  return result;
}

Legend Read(IXChartLegend* legend) {
  Legend l;
  l.depthUnits = Text(legend, &IXChartLegend::get_DepthUnits);
  l.heightUnits = Text(legend, &IXChartLegend::get_HeightUnits);
  l.soundingDatum = Text(legend, &IXChartLegend::get_SoundingDatum);
  l.verticalDatum = Text(legend, &IXChartLegend::get_VerticalDatum);
  l.horizontalDatum = Text(legend, &IXChartLegend::get_HorizontalDatum);
  REQUIRE(legend->get_EditionDate(&l.editionDate) == S_OK);
  REQUIRE(legend->get_UpdateDate(&l.updateDate) == S_OK);
  REQUIRE(legend->get_EditionNumber(&l.editionNumber) == S_OK);
  REQUIRE(legend->get_UpdateNumber(&l.updateNumber) == S_OK);
  l.sourceIdCode = Text(legend, &IXChartLegend::get_SourceIDCode);
  l.bathymetricQuality = Text(legend, &IXChartLegend::get_BathymetricQuality);
  REQUIRE(legend->get_NonBathymetricQuality(&l.nonBathymetricQuality) == S_OK);
  REQUIRE(legend->get_DefaultScale(&l.defaultScale) == S_OK);
  l.projection = Text(legend, &IXChartLegend::get_Projection);
  l.variationResult = legend->get_MagneticVariation(&l.magneticVariation);
  l.sourceProducingAgency = Text(legend, &IXChartLegend::get_SourceProducingAgency);
  return l;
}

void CheckDefaults(const Legend& l) {
  CHECK(l.depthUnits == "Meters");
  CHECK(l.heightUnits == "Meters");
  CHECK(l.soundingDatum == "Not defined");
  CHECK(l.verticalDatum == "Not defined");
  CHECK(l.horizontalDatum == "WGS-84");
  CHECK(l.editionDate == kNoValue);  // all zero: no value, not the platform's 1999-11-30
  CHECK(l.updateDate == kNoValue);
  CHECK(l.editionNumber == 0);
  CHECK(l.updateNumber == 0);
  CHECK(l.sourceIdCode.empty());
  CHECK(l.bathymetricQuality.empty());
  CHECK(l.nonBathymetricQuality == 0.0);
  CHECK(l.defaultScale == 0);
  CHECK(l.projection == "MERCATOR");
  CHECK(l.magneticVariation == kNoValue);
  CHECK(l.variationResult == S_FALSE);
  CHECK(l.sourceProducingAgency.empty());
}

// The registry the legend reads: KeyPath (the real agency table) and the reporter's switches.
struct LegendSettings {
  SavedRegistryValue keyPath{HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine\\Brdata\\Enum", "KeyPath"};
  SavedRegistryValue logMask{HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine", "LogBRCL"};
  SavedRegistryValue logFile{HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine", "LogFileBRCL"};
  LegendSettings() {
    keyPath.SetString(BR_AGENCY_FOLDER "\\");
    logMask.Delete();
  }
};

ComRef<IXChartLegend> NewLegend(const DllUnderTest& dll) {
  ComRef<IXChartLegend> legend;
  REQUIRE(dll.Create(CLSID_XChartLegend, IID_IXChartLegend, legend.OutVoid()) == S_OK);
  return legend;
}

// A scene of one chart database "TEST" with the vector dataset LEG1 and the raster RAS1,
// over a plate carrée projection "p" of 10000 pixels per degree whose centre (50 N, 0 E)
// lands on pixel (1, 1): 0.003 degree of longitude is 30 pixels.
struct SceneText {
  std::string header = R"("scale": 12000, "edition": 4, "update": 1, "updateDate": "2024-02-03",
                           "issueDate": "2023-01-02", "sourceAgency": 550, "sourceId": "US5TEST")";
  std::string parameters = R"("horizontalDatum": 2, "verticalDatum": 3, "soundingDatum": 23)";
  std::string extra = R"("properties": {"2": {"UI2": 5}})";
  std::string objects;
  std::string chartHeader = R"({"size": 300, "fields": [{"at": 0, "u32": 170}, {"at": 25, "i32": 50000},
      {"at": 29, "u8": 3}, {"at": 168, "u8": 2}, {"at": 271, "u8": 3}, {"at": 276, "u8": 23},
      {"at": 280, "u8": 2}, {"at": 284, "u8": 3}]})";
  std::string chartIssue = R"({"size": 64, "fields": [{"at": 21, "date": "2023-03-01"}, {"at": 37, "date": "2021-06-15"}]})";

  std::string Json() const {
    return R"({"format": "chartscene 1", "databases": [{"name": "TEST", "kind": "chart", "datasets": [
      {"id": "LEG1", "header": {)" + header + R"(}, "parameters": {)" + parameters + "}, " + extra +
           R"(, "objects": [)" + objects + R"(]},
      {"id": "RAS1", "type": "raster", "chartHeader": )" + chartHeader + R"(, "chartIssue": )" + chartIssue + R"(}]}],
      "projections": [{"name": "p", "kind": "plateCarree", "centre": [50, 0], "pixelsPerDegree": 10000, "size": [2, 2]}]})";
  }
};

std::string MagVar(const char* name, double lon, const std::string& attributes) {
  return R"({"name": ")" + std::string(name) + R"(", "class": "MAGVAR", "point": [50, )" + std::to_string(lon) +
         R"(], "attributes": {)" + attributes + "}}";
}

// The meta objects of a whole area around the centre.
const std::string kAreaMetaObjects = R"(
  {"name": "quality", "class": "M_QUAL", "area": [[49.9, -0.3], [50.1, -0.3], [50.1, 0.3], [49.9, 0.3]], "attributes": {"CATZOC": 3}},
  {"name": "accuracy", "class": "M_ACCY", "area": [[49.9, -0.3], [50.1, -0.3], [50.1, 0.3], [49.9, 0.3]], "attributes": {"POSACC": {"R4": 2.5}}})";

class TestScene {
public:
  explicit TestScene(const SceneText& text) { Load(text); }
  void Load(const SceneText& text) {
    WriteTextFile(file_, text.Json());
    const HRESULT hr = client.Load(Wide(file_));
    INFO(std::string(client.LastError().begin(), client.LastError().end()));
    REQUIRE(hr == S_OK);
    dataSet = client.Component(L"DataSet", L"LEG1");
    raster = client.Component(L"DataSet", L"RAS1");
    projection = client.Component(L"Projection", L"p");
  }
  SceneClient client;
  ComRef<IUnknown> dataSet, raster, projection;

private:
  ScratchFolder folder_;
  std::string file_ = folder_ / "scene.json";
};

}  // namespace

TEST_CASE("defaults: after creation and after a null call; null out-pointers") {
  LegendSettings settings;
  DllUnderTest dll;
  {
    auto legend = NewLegend(dll);
    CheckDefaults(Read(legend.Get()));
    SceneClient scene;
    REQUIRE(scene.Load(SceneClient::SamplePath()) == S_OK);
    auto dataSet = scene.Component(L"DataSet", L"FR5BR010");
    auto projection = scene.Component(L"Projection", L"chart");
    CHECK(legend->SetLegendData(dataSet.Get(), projection.Get(), Unit(48.35), Unit(-4.55)) == S_OK);
    CHECK(Read(legend.Get()).editionNumber == 3);
    CHECK(legend->SetLegendData(nullptr, projection.Get(), 0, 0) == S_OK);
    CheckDefaults(Read(legend.Get()));
    CHECK(legend->SetLegendData(dataSet.Get(), nullptr, 0, 0) == S_OK);
    CheckDefaults(Read(legend.Get()));

    CHECK(legend->get_DepthUnits(nullptr) == E_POINTER);
    CHECK(legend->get_EditionDate(nullptr) == E_POINTER);
    CHECK(legend->get_EditionNumber(nullptr) == E_POINTER);
    CHECK(legend->get_NonBathymetricQuality(nullptr) == E_POINTER);
    CHECK(legend->get_MagneticVariation(nullptr) == E_POINTER);
    CHECK(legend->get_SourceProducingAgency(nullptr) == E_POINTER);
    ComRef<IConnectionPointContainer> points;
    CHECK(legend->QueryInterface(IID_IConnectionPointContainer, points.OutVoid()) == S_OK);
  }
}

TEST_CASE("the sample scene's vector dataset: every property") {
  LegendSettings settings;
  DllUnderTest dll;
  {
    auto legend = NewLegend(dll);
    SceneClient scene;
    REQUIRE(scene.Load(SceneClient::SamplePath()) == S_OK);
    auto dataSet = scene.Component(L"DataSet", L"FR5BR010");
    auto projection = scene.Component(L"Projection", L"chart");
    REQUIRE(legend->SetLegendData(dataSet.Get(), projection.Get(), Unit(48.35), Unit(-4.55)) == S_OK);
    const Legend l = Read(legend.Get());
    CHECK(l.depthUnits == "Meters");
    CHECK(l.heightUnits == "Meters");
    CHECK(l.soundingDatum == "Lowest astronomical tide");  // VERDAT 23 of element 28
    CHECK(l.verticalDatum == "Mean sea level");             // VERDAT 3 of element 27
    CHECK(l.horizontalDatum == "WGS 84");                   // the geodesy library's name of HORDAT 2
    CHECK(l.editionDate == Date(2022, 11, 15));
    CHECK(l.updateDate == Date(2023, 5, 2));
    CHECK(l.editionNumber == 3);
    CHECK(l.updateNumber == 2);
    CHECK(l.sourceIdCode == "SHOM 7401");
    CHECK(l.sourceProducingAgency == "Service Hydrographique et Oceanographique de la Marine, France");
    CHECK(l.bathymetricQuality == "zone of confidence A2");
    CHECK(l.nonBathymetricQuality == doctest::Approx(2.5));
    CHECK(l.defaultScale == 22000);
    CHECK(l.projection == "MERCATOR");
    CHECK(l.variationResult == S_OK);
    CHECK(l.magneticVariation == doctest::Approx(-1.5 + 7.0 / 60.0 * (CurrentYear() - 2020)));
  }
}

TEST_CASE("the cache: the same dataset is not read again, the position is") {
  LegendSettings settings;
  DllUnderTest dll;
  SceneProbe probe;
  {
    auto legend = NewLegend(dll);
    SceneText text;
    // The variation object lies 2000 pixels east of the projection's pixel (0, 0), off the
    // screen-sized rectangle around it.
    text.objects = kAreaMetaObjects + "," + MagVar("near", 0.2, R"("VALMAG": 1.25)");
    TestScene scene(text);
    const long parameters = probe.Counter("calls.IGeoDataSet.GetParameters");
    const long selections = probe.Counter("calls.IGeoDatabase.CreateSelection");
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0.2)) == S_OK);
    Legend first = Read(legend.Get());
    CHECK(first.magneticVariation == 1.25);  // no annual change, no year: the value alone
    CHECK(first.bathymetricQuality == "zone of confidence B");
    CHECK(first.nonBathymetricQuality == 2.5);
    CHECK(probe.Counter("calls.IGeoDataSet.GetParameters") == parameters + 1);

    // The same place again: nothing of the dataset is read twice.
    const long hits = probe.Counter("calls.IGeoObject.HitTest");
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0.2)) == S_OK);
    CHECK(probe.Counter("calls.IGeoDataSet.GetParameters") == parameters + 1);
    CHECK(probe.Counter("calls.IGeoDatabase.CreateSelection") == selections + 1);
    CHECK(probe.Counter("calls.IGeoObject.HitTest") > hits);  // but the meta objects are
    const Legend again = Read(legend.Get());
    CHECK(again.sourceIdCode == "US5TEST");
    CHECK(again.magneticVariation == 1.25);

    // Far outside every meta object and off the screen rectangle: the position's fields go,
    // the header's and parameters' stay.
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(40), Unit(10)) == S_OK);
    const Legend away = Read(legend.Get());
    CHECK(away.magneticVariation == kNoValue);
    CHECK(away.variationResult == S_FALSE);
    CHECK(away.bathymetricQuality.empty());
    CHECK(away.nonBathymetricQuality == 0.0);
    CHECK(away.editionNumber == 4);
    CHECK(away.updateNumber == 5);  // the embedded update number (property 2) before the header's
    CHECK(away.soundingDatum == "Lowest astronomical tide");
    CHECK(away.sourceProducingAgency == "Office of Coast Survey, USA");
    CHECK(probe.Counter("calls.IGeoDataSet.GetParameters") == parameters + 1);

    // A new update of the same dataset and edition is a new key.
    text.header += R"(, "identity": "4C454731000000000000000000000004")";
    text.extra = R"("properties": {"2": {"UI2": 6}})";
    scene.Load(text);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    CHECK(probe.Counter("calls.IGeoDataSet.GetParameters") == parameters + 2);
    text.header.replace(text.header.find("\"update\": 1"), 11, "\"update\": 2");
    text.extra = R"("properties": {"2": {"UI2": 7}})";
    scene.Load(text);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    CHECK(probe.Counter("calls.IGeoDataSet.GetParameters") == parameters + 3);
    CHECK(Read(legend.Get()).updateNumber == 7);
    CHECK(probe.Counter("selections.open") == 0);
  }
}

TEST_CASE("near and far magnetic variation objects") {
  LegendSettings settings;
  DllUnderTest dll;
  {
    auto legend = NewLegend(dll);
    const std::string tenYearsAgo = std::to_string(CurrentYear() - 10);
    SceneText text;
    // "near" at pixel (1, 1); "far" 30 pixels east; "stale" has a change but no year.
    text.objects = MagVar("near", 0.0, R"("VALMAG": 2.5, "VALACM": 6, "RYRMGV": ")" + tenYearsAgo + "\"") + "," +
                   MagVar("far", 0.003, R"("VALMAG": -4.0)");
    TestScene scene(text);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    CHECK(Read(legend.Get()).magneticVariation == doctest::Approx(3.5));
    // At "far": it is within 8 pixels and wins over "near", which is on the screen only.
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0.003)) == S_OK);
    CHECK(Read(legend.Get()).magneticVariation == doctest::Approx(-4.0));
    // Between them, 15 pixels from each: the first on the screen gives the value.
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0.0015)) == S_OK);
    CHECK(Read(legend.Get()).magneticVariation == doctest::Approx(3.5));

    text.objects = MagVar("stale", 0.0, R"("VALMAG": 2.0, "VALACM": 6)");
    scene.Load(text);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    CHECK(Read(legend.Get()).magneticVariation == 2.0);  // not 2 + 0.1 x the year number

    // A missing value is no variation at all, not 0 degrees; a missing change counts as 0.
    text.objects = MagVar("blank", 0.0, R"("VALMAG": null, "VALACM": 6, "RYRMGV": "2020")") + "," +
                   MagVar("steady", 0.003, R"("VALMAG": 1.5, "VALACM": null, "RYRMGV": "2020")");
    scene.Load(text);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    CHECK(Read(legend.Get()).magneticVariation == 1.5);  // from "steady", on the screen
  }
}

TEST_CASE("the raster dataset") {
  LegendSettings settings;
  DllUnderTest dll;
  {
    auto legend = NewLegend(dll);
    TestScene scene{SceneText()};
    REQUIRE(legend->SetLegendData(scene.raster.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    const Legend l = Read(legend.Get());
    CHECK(l.depthUnits == "feet");   // DUNITS 3
    CHECK(l.heightUnits == "feet");  // HUNITS 2
    CHECK(l.soundingDatum == "Lowest astronomical tide");
    CHECK(l.verticalDatum == "Mean sea level");
    CHECK(l.horizontalDatum == "European 1950");
    CHECK(l.projection == "TRANSVERSE MERCATOR");
    CHECK(l.editionDate == Date(2021, 6, 15));
    CHECK(l.updateDate == Date(2023, 3, 1));
    CHECK(l.editionNumber == -1);
    CHECK(l.updateNumber == -1);
    CHECK(l.defaultScale == 50000);
    CHECK(l.sourceProducingAgency == "Service Hydrographique et Oceanographique de la Marine, France");
    CHECK(l.sourceIdCode == "FR");
    CHECK(l.bathymetricQuality.empty());
    CHECK(l.nonBathymetricQuality == kNoValue);
    CHECK(l.variationResult == S_FALSE);

    // A short header keeps the defaults of the fields it lacks; an unconvertible date is no value.
    SceneText shortText;
    shortText.chartHeader = R"({"size": 30, "fields": [{"at": 0, "u32": 99999}, {"at": 29, "u8": 9}]})";
    shortText.chartIssue = R"({"size": 40, "fields": [{"at": 21, "f64": 1e300}]})";
    scene.Load(shortText);
    REQUIRE(legend->SetLegendData(scene.raster.Get(), scene.projection.Get(), 0, 0) == S_OK);
    const Legend s = Read(legend.Get());
    CHECK(s.depthUnits == "Meters");  // code 9 is not a depth unit
    CHECK(s.projection == "MERCATOR");
    CHECK(s.sourceProducingAgency == "99999");
    CHECK(s.defaultScale == 0);
    CHECK(s.updateDate == kNoValue);
    CHECK(s.editionDate == kNoValue);
  }
}

TEST_CASE("header and parameter mends") {
  LegendSettings settings;
  DllUnderTest dll;
  SceneProbe probe;
  {
    auto legend = NewLegend(dll);
    SceneText text;
    // Edition 0 and no dates.
    text.header = R"("scale": 9000, "edition": 0, "sourceId": "ABCDEFGHIJKLMNOP")";
    text.parameters = R"("23": "not a datum", "27": {"I4": 3}, "28": {"R8": 1e9})";
    TestScene scene(text);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), 0, 0) == S_OK);
    Legend l = Read(legend.Get());
    CHECK(l.sourceIdCode == "ABCDEFGHIJKLMNOP");
    CHECK(l.defaultScale == 9000);
    CHECK(l.editionDate == kNoValue);
    CHECK(l.horizontalDatum == "WGS-84");        // a text does not convert to a datum code
    CHECK(l.verticalDatum == "Mean sea level");  // VT_I4 3 converts to the byte 3
    CHECK(l.soundingDatum == "Not defined");     // 1e9 does not fit a byte
    // After a reset, the same dataset (edition 0) shows its header again.
    REQUIRE(legend->SetLegendData(nullptr, nullptr, 0, 0) == S_OK);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), 0, 0) == S_OK);
    l = Read(legend.Get());
    CHECK(l.defaultScale == 9000);
    CHECK(l.sourceIdCode == "ABCDEFGHIJKLMNOP");

    // A header cut inside the source identification text: the bytes the array holds, no more.
    text.header = R"("scale": 9000, "edition": 1, "sourceId": "ABCDEFGHIJKLMNOP", "sourceAgency": 550, "size": 66)";
    scene.Load(text);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), 0, 0) == S_OK);
    l = Read(legend.Get());
    CHECK(l.sourceIdCode == "ABCDEF");
    CHECK(l.editionNumber == 1);
    CHECK(l.sourceProducingAgency == "Office of Coast Survey, USA");  // +52 to +56 lie inside

    // Fewer than 34 parameters: the datums keep their defaults; the header still counts.
    text.header = R"("scale": 1000, "edition": 2)";
    text.parameters = R"("count": 33, "verticalDatum": 3)";
    scene.Load(text);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), 0, 0) == S_OK);
    l = Read(legend.Get());
    CHECK(l.verticalDatum == "Not defined");
    CHECK(l.horizontalDatum == "WGS-84");
    CHECK(l.defaultScale == 1000);
  }
}

TEST_CASE("a missing geodesy library: Unknown Datum and no hit tests") {
  LegendSettings settings;
  ScratchFolder folder;
  const std::wstring copy = Wide(folder / "BR_Info.dll");
  REQUIRE(CopyFileW(BuiltDllPath().c_str(), copy.c_str(), FALSE));
  SceneProbe probe;
  {
    DllUnderTest dll(copy);
    auto legend = NewLegend(dll);
    SceneText text;
    text.objects = kAreaMetaObjects + "," + MagVar("near", 0.0, R"("VALMAG": 1.0)");
    TestScene scene(text);
    const long hits = probe.Counter("calls.IGeoObject.HitTest");
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    const Legend l = Read(legend.Get());
    CHECK(l.horizontalDatum == "Unknown Datum");
    CHECK(l.variationResult == S_FALSE);
    CHECK(l.bathymetricQuality.empty());
    CHECK(l.editionNumber == 4);
    CHECK(probe.Counter("calls.IGeoObject.HitTest") == hits);
  }
}

TEST_CASE("failures: the log line, Retry and Abort through the box, what stays after each") {
  LegendSettings settings;
  ScratchFolder folder;
  const std::string log = folder / "brcl.log";
  settings.logFile.SetString(log);
  settings.logMask.SetDword(5);  // file and box; read when the library loads
  SceneProbe probe;
  DllUnderTest dll;
  {
    auto legend = NewLegend(dll);
    SceneText text;
    text.objects = kAreaMetaObjects;
    TestScene scene(text);

    // Neither a dataset nor a raster dataset: E_NOINTERFACE, reported; Retry runs again.
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    {
      BoxPresser presser({IDRETRY, IDABORT});
      CHECK(legend->SetLegendData(scene.projection.Get(), scene.projection.Get(), 0, 0) == S_OK);
      REQUIRE(presser.texts.size() == 2);
      CHECK(presser.abortRetryIgnore == 2);
      CHECK(presser.texts[0].find("CXChartLegend::SetLegendData") != std::string::npos);
      CHECK(presser.texts[0].find("hres:0x80004002") != std::string::npos);
    }
    CheckDefaults(Read(legend.Get()));  // the failed fill leaves the defaults
    const std::string lines = ReadWholeFile(log);
    std::size_t count = 0;
    for (std::size_t at = lines.find("ERR: "); at != std::string::npos; at = lines.find("ERR: ", at + 1)) ++count;
    CHECK(count == 2);
    CHECK(lines.find("file:XChartLegend.cpp(-1) CXChartLegend::SetLegendData line:-1 code:20000000") !=
          std::string::npos);

    // A failed selection after a new header keeps what was filled, reports a line, and
    // lists no meta object (the next call reads the dataset again).
    probe.SetFault("IGeoDatabase.CreateSelection", E_FAIL);
    const long byId = probe.Counter("calls.IGeoDataSet.GetObjectById");
    {
      BoxPresser presser({IDABORT});
      REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
      CHECK(presser.texts.size() == 1);
    }
    probe.ClearFaults();
    Legend l = Read(legend.Get());
    CHECK(l.editionNumber == 4);
    CHECK(l.verticalDatum == "Mean sea level");
    CHECK(l.bathymetricQuality.empty());
    CHECK(probe.Counter("calls.IGeoDataSet.GetObjectById") == byId);
    CHECK(probe.Counter("selections.open") == 0);
    const std::string after = ReadWholeFile(log);
    CHECK(after.find("hres:0x80004005") != std::string::npos);
    CHECK(after.find("XChartLegend.cpp(-1)", after.rfind("ERR: ")) == std::string::npos);  // a line, not -1

    // The next call lists the meta objects; GeoToPixel failing skips the hit tests only.
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    CHECK(Read(legend.Get()).bathymetricQuality == "zone of confidence B");
    probe.SetFault("IGeoProjection.GeoToPixel", E_FAIL);
    const long hits = probe.Counter("calls.IGeoObject.HitTest");
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), Unit(50), Unit(0)) == S_OK);
    probe.ClearFaults();
    l = Read(legend.Get());
    CHECK(probe.Counter("calls.IGeoObject.HitTest") == hits);
    CHECK(l.bathymetricQuality.empty());
    CHECK(l.editionNumber == 4);
  }
}

TEST_CASE("re-entrancy: the host calls and releases the legend while the box is up") {
  LegendSettings settings;
  settings.logMask.SetDword(4);
  DllUnderTest dll;
  {
    SceneText text;
    TestScene scene(text);
    IXChartLegend* legend = nullptr;
    REQUIRE(dll.Create(CLSID_XChartLegend, IID_IXChartLegend, reinterpret_cast<void**>(&legend)) == S_OK);
    REQUIRE(legend->SetLegendData(scene.dataSet.Get(), scene.projection.Get(), 0, 0) == S_OK);
    HRESULT nested = E_FAIL;
    long nestedEdition = -5;
    BoxPresser presser({IDABORT}, [&] {
      nested = legend->SetLegendData(nullptr, nullptr, 0, 0);  // would reset the record
      legend->get_EditionNumber(&nestedEdition);
      legend->Release();  // the host lets go while the box is up
    });
    CHECK(legend->SetLegendData(scene.projection.Get(), scene.projection.Get(), 0, 0) == S_OK);
    CHECK(presser.texts.size() == 1);
    CHECK(nested == S_OK);
    CHECK(nestedEdition == 4);  // the nested call did nothing
  }
}
