// XChartLegend against a misbehaving host: every operation of the stand-in chart host that
// SetLegendData calls, failing or answering wrongly with success (a VARIANT of another
// type, an array of another shape, no out-value, an endless enumerator, a text of a
// megabyte). Each row names the operation and whether the reporter logs; every run
// answers S_OK, leaves each property at its clean value or its default, and gives back
// every wrapper and selection of the host.
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/FaultSweep.h"
#include "tests/wine/common/SceneClient.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/registry_test_support.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <cfloat>
#include <cmath>
#include <cstdio>
#include <set>
#include <string>

using namespace br::test;

namespace {

constexpr double kNoValue = DBL_MAX;
constexpr std::size_t kHugeText = std::size_t(1) << 20;

long Unit(double degrees) { return static_cast<long>(std::lround(degrees * 1e7)); }

struct Legend {
  std::string texts[9];  // depth, height, sounding, vertical, horizontal, source id, quality, projection, agency
  double editionDate = 0, updateDate = 0, nonBathymetricQuality = 0, magneticVariation = 0;
  long editionNumber = 0, updateNumber = 0, defaultScale = 0;
};

std::string Text(IXChartLegend* legend, HRESULT (STDMETHODCALLTYPE IXChartLegend::*get)(BSTR*)) {
  BSTR text = nullptr;
  CHECK((legend->*get)(&text) == S_OK);
  std::string result;
  for (const wchar_t* c = text; c && *c; ++c) result += static_cast<char>(*c);
  SysFreeString(text);
  return result;
}

Legend Read(IXChartLegend* legend) {
  Legend l;
  HRESULT (STDMETHODCALLTYPE IXChartLegend::*texts[])(BSTR*) = {
      &IXChartLegend::get_DepthUnits,    &IXChartLegend::get_HeightUnits,    &IXChartLegend::get_SoundingDatum,
      &IXChartLegend::get_VerticalDatum, &IXChartLegend::get_HorizontalDatum, &IXChartLegend::get_SourceIDCode,
      &IXChartLegend::get_BathymetricQuality, &IXChartLegend::get_Projection,
      &IXChartLegend::get_SourceProducingAgency};
  for (int i = 0; i < 9; ++i) l.texts[i] = Text(legend, texts[i]);
  CHECK(legend->get_EditionDate(&l.editionDate) == S_OK);
  CHECK(legend->get_UpdateDate(&l.updateDate) == S_OK);
  CHECK(legend->get_NonBathymetricQuality(&l.nonBathymetricQuality) == S_OK);
  const HRESULT variation = legend->get_MagneticVariation(&l.magneticVariation);
  CHECK(variation == (l.magneticVariation == kNoValue ? S_FALSE : S_OK));
  CHECK(legend->get_EditionNumber(&l.editionNumber) == S_OK);
  CHECK(legend->get_UpdateNumber(&l.updateNumber) == S_OK);
  CHECK(legend->get_DefaultScale(&l.defaultScale) == S_OK);
  return l;
}

// Each field of got is the clean fill's, the reset's, or (texts the catalogue or the text
// table gave) empty or the host's huge text, which the legend passes on as it came.
void CheckFields(const Legend& got, const Legend& clean, const Legend& reset) {
  for (int i = 0; i < 9; ++i) {
    INFO("text property " << i << ": " << got.texts[i].substr(0, 40));
    const std::string& text = got.texts[i];
    // The stand-in's long texts are letters x, cut to what the legend's buffers hold.
    const bool huge = !text.empty() && text.size() <= kHugeText && text.find_first_not_of('x') == std::string::npos;
    CHECK((text == clean.texts[i] || text == reset.texts[i] || text.empty() || huge));
  }
  const auto either = [](double got, double clean, double reset) { return got == clean || got == reset; };
  CHECK(either(got.editionDate, clean.editionDate, reset.editionDate));
  CHECK(either(got.updateDate, clean.updateDate, reset.updateDate));
  CHECK(either(got.nonBathymetricQuality, clean.nonBathymetricQuality, reset.nonBathymetricQuality));
  CHECK(either(got.magneticVariation, clean.magneticVariation, reset.magneticVariation));
  CHECK(either(got.editionNumber, clean.editionNumber, reset.editionNumber));
  CHECK(either(got.updateNumber, clean.updateNumber, reset.updateNumber));
  CHECK(either(got.defaultScale, clean.defaultScale, reset.defaultScale));
}

// An operation SetLegendData calls, and the fault kinds after which the reporter writes a
// line (by the stand-in's Misanswer number; 0 is failing).
struct Row {
  const char* operation;
  std::set<int> reports;
};

const Row kRows[] = {
    // The vector fill: the selection of the meta objects is the one step that reports.
    {"IGeoDataSet.GetDatabase", {0, 3}},
    {"IGeoDataSet.GetHeader", {}},
    {"IGeoDataSet.GetParameters", {}},
    {"IGeoDataSet.GetDataSetProperty", {}},
    {"IGeoDataSet.GetObjectEnum", {0, 3}},
    {"IGeoDataSet.GetObjectById", {}},
    {"IGeoDatabase.CreateSelection", {0, 3}},
    {"IGeoDatabase.ReleaseSelection", {}},
    {"IGeoDatabase.GetKindId", {}},
    {"IGeoCatalog.GetAttributeCode", {}},
    {"IGeoCatalog.GetEnumTextLength", {}},
    {"IGeoCatalog.GetEnumText", {}},
    {"IGeoSelectionEnum.SetSelection", {0}},
    {"IGeoSelectionEnum.Reset", {0}},
    {"IGeoSelectionEnum.Next", {}},
    {"IGeoObject.GetId", {}},
    {"IGeoObject.GetClassCode", {}},
    {"IGeoObject.GetDataSet", {}},
    {"IGeoObject.GetAttribute", {}},
    {"IGeoObject.HitTest", {}},
    {"IGeoAttribute.GetValue", {}},
    {"IGeoProjection.GeoToPixel", {}},
    // The raster fill needs all three records.
    {"IGeoRasterDataSet.GetChartHeader", {0, 1, 2, 3, 5}},
    {"IGeoRasterDataSet.GetChartIssue", {0, 3}},
    {"IGeoRasterDataSet.GetChartIssueRecord", {0, 1, 2, 3, 5}},
    // The localised texts of the defaults.
    {"ITextTable.GetText", {}},
};

std::size_t CountLines(const std::string& text) {
  std::size_t count = 0;
  for (std::size_t at = text.find("ERR: "); at != std::string::npos; at = text.find("ERR: ", at + 1)) ++count;
  return count;
}

}  // namespace

TEST_CASE("every host operation of SetLegendData failing or answering wrongly") {
  SavedRegistryValue keyPath{HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine\\Brdata\\Enum", "KeyPath"};
  SavedRegistryValue logMask{HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine", "LogBRCL"};
  SavedRegistryValue logFile{HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine", "LogFileBRCL"};
  keyPath.SetString(BR_AGENCY_FOLDER "\\");
  ScratchFolder folder;
  const std::string log = folder / "brcl.log";
  logFile.SetString(log);
  logMask.SetDword(1);  // the file only; read when the library loads
  SceneProbe probe;
  FaultSweep sweep(probe);
  {
    DllUnderTest dll;
    SceneClient scene;
    REQUIRE(scene.Load(SceneClient::SamplePath()) == S_OK);
    auto vector = scene.Component(L"DataSet", L"FR5BR010");
    auto raster = scene.Component(L"DataSet", L"FR3BR001");
    auto projection = scene.Component(L"Projection", L"chart");

    // The two fills of one run: a cache miss and a hit of the vector dataset, then the raster.
    Legend cleanVector, cleanRaster, reset;
    const auto run = [&](Legend& vectorLegend, Legend& rasterLegend) {
      ComRef<IXChartLegend> legend;
      REQUIRE(dll.Create(CLSID_XChartLegend, IID_IXChartLegend, legend.OutVoid()) == S_OK);
      CHECK(legend->SetLegendData(vector.Get(), projection.Get(), Unit(48.35), Unit(-4.55)) == S_OK);
      CHECK(legend->SetLegendData(vector.Get(), projection.Get(), Unit(48.35), Unit(-4.55)) == S_OK);
      vectorLegend = Read(legend.Get());
      CHECK(legend->SetLegendData(raster.Get(), projection.Get(), 0, 0) == S_OK);
      rasterLegend = Read(legend.Get());
    };
    {
      ComRef<IXChartLegend> legend;
      REQUIRE(dll.Create(CLSID_XChartLegend, IID_IXChartLegend, legend.OutVoid()) == S_OK);
      reset = Read(legend.Get());
    }
    run(cleanVector, cleanRaster);
    REQUIRE(cleanVector.editionNumber == 3);
    REQUIRE(cleanVector.magneticVariation != kNoValue);
    REQUIRE(cleanRaster.editionNumber == -1);
    REQUIRE(CountLines(ReadWholeFile(log)) == 0);

    auto held = sweep.Held();
    std::set<std::string> reachedOperations;
    for (const Row& row : kRows) {
      const std::string operation = row.operation;
      for (const FaultKind& kind : kFaultKinds) {
        const std::string what = operation + ", " + kind.name;
        INFO(what);
        const std::size_t linesBefore = CountLines(ReadWholeFile(log));
        const long made = probe.Counter("calls.IGeoDatabase.CreateSelection");
        const long released = probe.Counter("calls.IGeoDatabase.ReleaseSelection");
        Legend faultedVector, faultedRaster;
        const bool reached = sweep.Run(row.operation, kind, [&] { run(faultedVector, faultedRaster); });
        if (reached) reachedOperations.insert(operation);
        const bool logged = CountLines(ReadWholeFile(log)) > linesBefore;
        CHECK(logged == (reached && row.reports.count(kind.misanswer) == 1));
        if (operation == "IGeoDataSet.GetHeader" && kind.misanswer == 5) {
          // A header of a megabyte of letters: its first record's worth is read as it stands.
          CHECK(faultedVector.editionNumber == 0x7878);
          CHECK(faultedVector.defaultScale == 0x78787878);
          CHECK(faultedVector.texts[5] == std::string(252, 'x'));  // the source id ends in its field
          CHECK(faultedVector.texts[8] == "2021161080");            // an agency code without a name
        } else {
          CheckFields(faultedVector, cleanVector, reset);
        }
        CheckFields(faultedRaster, cleanRaster, reset);
        const std::string changes = FaultSweep::Changes(held, sweep.Held());
        if (operation == "IGeoDatabase.ReleaseSelection" && kind.misanswer == 0) {
          // Each selection made was given back; the host failing to let go is its own leak.
          CHECK(probe.Counter("calls.IGeoDatabase.CreateSelection") - made ==
                probe.Counter("calls.IGeoDatabase.ReleaseSelection") - released);
          CHECK(changes.rfind("selections.open", 0) == 0);
          held = sweep.Held();
        } else {
          CHECK(changes == "");
        }
      }
    }
    // Every operation of the table is one SetLegendData calls.
    CHECK(reachedOperations.size() == sizeof kRows / sizeof kRows[0]);
    std::printf("%s\n", sweep.Summary("XChartLegend", sizeof kRows / sizeof kRows[0]).c_str());
    const std::string lines = ReadWholeFile(log);
    CHECK(lines.find("CXChartLegend::SetLegendData") != std::string::npos);
    CHECK(lines.find("hres:0x80004005") != std::string::npos);
    vector.Reset();
    raster.Reset();
    projection.Reset();
    CHECK(dll.CanUnloadNow() == S_OK);
  }
}
