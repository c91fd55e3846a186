// The attribute table panel and the stacked text panel filled from objects of scenes
// written here, read through IAccessible: the order of attributes, headings and related
// objects, the cleaning of values, magnetic variation, and what is left out.
#include <doctest/doctest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "inspector/panels/cAttrViewPanel_Tbl.h"
#include "inspector/panels/cP_SHPanel.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/ScratchScene.h"
#include "tests/wine/inspector/panels/panel_test_support.h"
#include "toolkit/base/class_records.h"

using namespace br;
using br::inspector::cAttrViewPanel_Tbl;
using br::inspector::cP_SHPanel;
using br::test::MountedPanel;
using br::test::Names;
using br::test::ScratchScene;

namespace {

// One chart dataset: a buoy with its information moved up, magnetic variations, a
// landmark holding objects of several kinds, a harbour service, a hidden class and an
// internal reference; one dataset of the host's own kind.
const char* const kScene = R"({
  "format": "chartscene 1",
  "catalogue": {
    "classes": [{"code": 55059, "acronym": "srvint", "name": "Internal service"}],
    "attributes": [{"code": 57011, "acronym": "srvtyp", "name": "Service", "type": "S"}],
    "hidden": ["M_NSYS"], "unprintable": ["SCAMIN"]
  },
  "databases": [
    {"name": "TEST", "kind": "chart", "datasets": [{"id": "TESTDS01", "objects": [
      {"name": "buoy", "class": "BOYLAT", "point": [48.3, -4.5], "properties": {"500": {"I4": 184}},
       "attributes": {"COLOUR": [3, 1], "SCAMIN": 50000, "BOYSHP": 2,
                      "INFORM": "Pass west<BR>keep clear", "OBJNAM": "Buoy 1"}},
      {"name": "plain-buoy", "class": "BOYLAT", "point": [48.3, -4.5],
       "attributes": {"INFORM": "Pass|west", "OBJNAM": "Buoy 2"}},
      {"name": "west", "class": "MAGVAR", "point": [48.3, -4.5], "attributes": {"VALMAG": {"R8": -3.5}}},
      {"name": "east", "class": "MAGVAR", "point": [48.3, -4.5], "attributes": {"VALMAG": {"R8": 2}}},
      {"name": "none", "class": "MAGVAR", "point": [48.3, -4.5], "attributes": {"VALMAG": {"R8": 0}}},
      {"name": "referenced", "class": "BOYLAT", "point": [48.3, -4.5],
       "attributes": {"OBJNAM": "Buoy 3", "INFORM": "see 0x1F2"}},
      {"name": "zulu", "class": "BOYLAT", "point": [48.3, -4.5], "attributes": {"OBJNAM": "Zulu"}},
      {"name": "alpha", "class": "BOYLAT", "point": [48.3, -4.5], "attributes": {"OBJNAM": "Alpha"}},
      {"name": "light", "class": "LIGHTS", "point": [48.3, -4.5], "attributes": {"OBJNAM": "Light"}},
      {"name": "shop", "class": "srvint", "primitive": "none",
       "attributes": {"srvtyp": "Chandlery", "INFORM": "Open 8:00-19:00|closed Sunday"}},
      {"name": "system", "class": "M_NSYS", "primitive": "none", "attributes": {"MARSYS": 1}},
      {"name": "holding-system", "class": "M_NSYS", "primitive": "none", "attributes": {"MARSYS": 2},
       "members": ["plain-buoy"]},
      {"name": "empty", "class": "BOYLAT", "point": [48.3, -4.5]},
      {"name": "tower", "class": "LNDMRK", "point": [48.3, -4.5], "attributes": {"OBJNAM": "Tower"},
       "members": ["zulu", "light", "alpha", "shop"]}
    ]}]},
    {"name": "MINE", "kind": "user", "datasets": [{"id": "MINE01", "objects": [
      {"name": "mark", "class": "BOYLAT", "point": [48.3, -4.5],
       "attributes": {"INFORM": "Own|mark", "OBJNAM": "Mine"}}
    ]}]}
  ]
})";

// Records the failures a panel reports instead of logging them.
struct ReportedFailures : br::cErrHandler {
  struct Failure {
    std::string className;
    std::string function;
    std::int32_t result;
  };
  std::vector<Failure> seen;
  bool Report(const char* className, br::ErrRecord& record) noexcept override {
    seen.push_back({className, record.function, record.result});
    return true;
  }
  bool AllAre(const char* function, HRESULT result) const {
    if (seen.empty()) return false;
    for (const Failure& f : seen) {
      if (f.className != "cP_SHPanel" || f.function != function || f.result != result) return false;
    }
    return true;
  }
};

}  // namespace

TEST_CASE("attribute table: the name first, the information second, values cleaned, unprintable left out") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  CHECK(toolkit::isKindOf(&m.panel, &toolkit::records::cP_SHPanel));
  CHECK_FALSE(m.panel.HasContent());

  REQUIRE(m.panel.FillObject(scene.Object(L"buoy").Get(), true, true) == S_OK);
  CHECK(m.Rows() == Names{L"Buoy, lateral Buoy 1\t", L"Object name\tBuoy 1", L"Information\tPass west\rkeep clear",
                          L"Colour\tred\rwhite", L"Buoy shape\tcan (cylindrical)"});
  CHECK(m.Types() == std::vector<int>{1000, 4000, 4000, 4000, 4000});
  CHECK(m.panel.HasContent());

  // Without property 500 = 184 the information keeps its place; rows add up until cleared.
  m.panel.Clear();
  CHECK_FALSE(m.panel.HasContent());
  REQUIRE(m.panel.FillObject(scene.Object(L"plain-buoy").Get(), true, false) == S_OK);
  CHECK(m.Rows() == Names{L"Object name\tBuoy 2", L"Information\tPass\rwest"});
  REQUIRE(m.panel.FillObject(scene.Object(L"referenced").Get(), false, false) == S_OK);
  CHECK(m.Rows() == Names{L"Object name\tBuoy 2", L"Information\tPass\rwest", L"Object name\tBuoy 3"});

  // One attribute at a time: an unprintable one and an internal reference add nothing.
  Microsoft::WRL::ComPtr<IGeoAttribute> scale, reference, colour;
  REQUIRE(scene.Object(L"buoy")->GetAttribute(133, &scale) == S_OK);
  REQUIRE(scene.Object(L"referenced")->GetAttribute(102, &reference) == S_OK);
  REQUIRE(scene.Object(L"buoy")->GetAttribute(75, &colour) == S_OK);
  CHECK(m.panel.IsUnprintable(scale.Get()));
  CHECK_FALSE(m.panel.IsUnprintable(colour.Get()));
  CHECK(m.panel.AddAttributeToContent(scale.Get()) == S_FALSE);
  CHECK(m.panel.AddAttributeToContent(reference.Get()) == S_FALSE);
  CHECK(m.panel.AddAttributeToContent(colour.Get()) == S_OK);
  CHECK(m.Rows().size() == 4);
  CHECK(m.Rows().back() == L"Colour\tred\rwhite");
}

TEST_CASE("magnetic variation is written with its hemisphere, whatever the formatter says") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  for (const wchar_t* name : {L"west", L"east", L"none"}) {
    REQUIRE(m.panel.FillObject(scene.Object(name).Get(), false, false) == S_OK);
  }
  CHECK(m.Rows() == Names{L"Value of magnetic variation\t3.50\u00B0W", L"Value of magnetic variation\t2\u00B0E",
                          L"Value of magnetic variation\t0\u00B0 "});
}

TEST_CASE("related objects follow under their headings by label; lights and services never") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillObject(scene.Object(L"tower").Get(), true, true) == S_OK);
  CHECK(m.Rows() == Names{L"Landmark Tower\t", L"Object name\tTower", L"Buoy, lateral Alpha\t",
                          L"Object name\tAlpha", L"Buoy, lateral Zulu\t", L"Object name\tZulu"});

  // Drawn: headings in the highlight colour across the row, attributes in the text colour.
  const toolkit::Table& table = m.panel.table();
  wtest::Canvas canvas(500, 380, RGB(1, 2, 3));
  m.panel.table().paint(canvas.dc());
  const COLORREF heading = GetSysColor(COLOR_HIGHLIGHT);
  const RECT firstHeading = table.getCellRect(-1, 0);
  const RECT firstAttribute = table.getCellRect(-1, 1);
  CHECK(canvas.countIn(heading, firstHeading) > 0);
  CHECK(canvas.countIn(heading, firstAttribute) == 0);
  CHECK(canvas.countIn(GetSysColor(COLOR_WINDOWTEXT), firstAttribute) > 0);
  CHECK(canvas.countIn(RGB(1, 2, 3), firstHeading) == 0);  // the whole row is painted

  // Without related objects there is no heading at all.
  m.panel.Clear();
  REQUIRE(m.panel.FillObject(scene.Object(L"tower").Get(), true, false) == S_OK);
  CHECK(m.Rows() == Names{L"Object name\tTower"});
}

TEST_CASE("stacked text panel: heading, name and value rows one under the other") {
  MountedPanel<cP_SHPanel> m;
  ScratchScene scene(kScene);
  CHECK_FALSE(toolkit::isKindOf(&m.panel, &toolkit::records::cAttrViewPanel_Tbl));
  // The services tab: no heading, related objects on.
  REQUIRE(m.panel.FillObject(scene.Object(L"shop").Get(), false, true) == S_OK);
  CHECK(m.Rows() == Names{L"Service", L"Chandlery", L"Information", L"Open 8:00-19:00\rclosed Sunday"});
  CHECK(m.Types() == std::vector<int>{2000, 3000, 2000, 3000});

  // Names indented 30 pixels, values 60.
  wtest::Canvas canvas(500, 380, RGB(1, 2, 3));
  m.panel.table().paint(canvas.dc());
  const COLORREF ink = GetSysColor(COLOR_WINDOWTEXT);
  const auto inkIn = [&](int row, LONG from, LONG to) {
    RECT area = m.panel.table().getCellRect(-1, row);
    area.left = from;
    area.right = to;
    return canvas.countIn(ink, area);
  };
  CHECK(inkIn(0, 0, 30) == 0);
  CHECK(inkIn(0, 30, 200) > 0);
  CHECK(inkIn(1, 0, 60) == 0);
  CHECK(inkIn(1, 60, 200) > 0);

  m.panel.Clear();
  REQUIRE(m.panel.FillObject(scene.Object(L"tower").Get(), true, true) == S_OK);
  CHECK(m.Rows() == Names{L"Landmark Tower", L"Object name", L"Tower", L"Buoy, lateral Alpha", L"Object name",
                          L"Alpha", L"Buoy, lateral Zulu", L"Object name", L"Zulu"});
  CHECK(m.Types() == std::vector<int>{1000, 2000, 3000, 1000, 2000, 3000, 1000, 2000, 3000});
}

TEST_CASE("objects of the host's own kind show their attributes as listed") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillObject(scene.Object(L"mark").Get(), false, false) == S_OK);
  CHECK(m.Rows() == Names{L"Information\tOwn\rmark", L"Object name\tMine"});
}

TEST_CASE("what is not shown: hidden classes, empty objects, null objects, objects without a formatter") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  CHECK(m.panel.FillObject(scene.Object(L"system").Get(), true, true) == S_FALSE);
  CHECK_FALSE(m.panel.HasContent());
  // A hidden class still shows when the object holds others.
  REQUIRE(m.panel.FillObject(scene.Object(L"holding-system").Get(), false, false) == S_OK);
  CHECK(m.Rows() == Names{L"Marks navigational - System of\tIALA B"});
  m.panel.Clear();
  CHECK(m.panel.FillObject(scene.Object(L"empty").Get(), true, true) == S_OK);
  CHECK(m.panel.FillObject(nullptr, true, true) == E_INVALIDARG);
  CHECK(m.panel.AddAttributeToContent(nullptr) == E_INVALIDARG);
  CHECK_FALSE(m.panel.HasContent());

  m.settings.SetFormatter(nullptr);
  Microsoft::WRL::ComPtr<IGeoAttribute> name;
  REQUIRE(scene.Object(L"buoy")->GetAttribute(116, &name) == S_OK);
  CHECK(m.panel.AddAttributeToContent(name.Get()) == E_NOINTERFACE);
  CHECK(m.panel.FillObject(scene.Object(L"buoy").Get(), true, true) == S_OK);
  // Without a formatter the heading is the class code, and no attribute has a row.
  CHECK(m.Rows() == Names{L"17\t"});
}

TEST_CASE("host failures skip what they touch") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  br::test::SceneProbe probe;
  ReportedFailures failures;
  m.settings.SetErrorHandler(&failures);

  SUBCASE("no class code: E_FAIL and no rows") {
    probe.SetFault("IGeoObject.GetClassCode", E_FAIL);
    CHECK(m.panel.FillObject(scene.Object(L"buoy").Get(), true, true) == E_FAIL);
    CHECK_FALSE(m.panel.HasContent());
  }
  SUBCASE("no attribute flags: every attribute counts as printable") {
    probe.SetFault("IGeoCatalog.GetAttributeFlags", E_FAIL);
    REQUIRE(m.panel.FillObject(scene.Object(L"buoy").Get(), false, false) == S_OK);
    CHECK(m.Rows() == Names{L"Object name\tBuoy 1", L"Information\tPass west\rkeep clear", L"Colour\tred\rwhite",
                            L"Scale minimum\t50000", L"Buoy shape\tcan (cylindrical)"});
    CHECK(failures.seen.size() == 5);  // one per listed attribute
    CHECK(failures.AllAre("IsUNPRINTABLE", E_FAIL));
  }
  SUBCASE("the formatter fails: no attribute rows") {
    probe.SetFault("IObjectFormatter.FormatAttribute", E_ACCESSDENIED);
    REQUIRE(m.panel.FillObject(scene.Object(L"buoy").Get(), false, false) == S_OK);
    CHECK_FALSE(m.panel.HasContent());
    CHECK(failures.seen.size() == 4);  // the unprintable one is never formatted
    CHECK(failures.AllAre("_AddAttributeToContent", E_ACCESSDENIED));
  }
  probe.ClearFaults();
  m.settings.SetErrorHandler(nullptr);
}
