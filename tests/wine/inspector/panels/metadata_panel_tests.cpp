// The metadata of a dataset in the attribute table panel, read through IAccessible, and
// its text form, from scenes written here: chart and library rows in order, captions in
// the host's language, status words, datum texts and shifts, short header records, and
// what a failing host leaves out.
#include <doctest/doctest.h>

#include <fstream>
#include <string>

#include "inspector/panels/cAttrViewPanel_Tbl.h"
#include "inspector/panels/dataset_metadata.h"
#include "tests/wine/common/SceneProbe.h"
#include "tests/wine/common/ScratchScene.h"
#include "tests/wine/common/registry_test_support.h"
#include "tests/wine/inspector/panels/panel_test_support.h"

using namespace br;
using br::inspector::cAttrViewPanel_Tbl;
using br::inspector::FormatDataSetMetadata;
using br::test::MountedPanel;
using br::test::Names;
using br::test::ScratchScene;

namespace {

// A terminated chart dataset with every metadata field, one whose header record stops
// after 40 bytes, a library and a raster chart entry.
const char* const kScene = R"({
  "format": "chartscene 1",
  "databases": [{"name": "META", "kind": "chart", "datasets": [
    {"id": "TESTDS01",
     "header": {"scale": 22000, "level": 5, "edition": 3, "update": 2, "updateDate": "2023-05-02",
                "issueDate": "2022-11-15", "agency": 170, "sourceAgency": 550, "sourceId": "SHOM 7401",
                "terminated": true, "usage": 5},
     "parameters": {"official": 0, "title": "Goulet de Brest", "archiveCode": "A7401",
                    "horizontalDatum": 2, "horizontalDatumSource": 2, "datumShiftLon": 12000,
                    "datumShiftLat": -8000, "verticalDatum": 3, "soundingDatum": 23},
     "properties": {"2": {"UI2": 4}},
     "objects": [{"name": "buoy", "class": "BOYLAT", "point": [48.3, -4.5], "attributes": {"OBJNAM": "B"}}]},
    {"id": "SHORT01", "header": {"size": 40, "scale": 5000, "level": 2, "edition": 1, "updateDate": "2024-01-31",
                                 "agency": 170}},
    {"id": "LIBBRST", "type": "library", "header": {"level": 3, "fileName": "LIBBRST.LIB"},
     "parameters": {"name": "Brest library", "description": "Harbour objects", "11": {"EMPTY": null},
                    "sourceId": "LB 1", "libraryEdition": 7, "editionDate": "2024-03-01",
                    "title": "metres", "27": {"BSTR": "LAT"}, "25": {"BSTR": "MSL"},
                    "29": {"BSTR": "WGS 84"}, "31": {"BSTR": "Mercator"}}},
    {"id": "RASTER1", "type": "raster"},
    {"id": "RASTER2", "type": "raster",
     "chartHeader": {"size": 556, "fields": [
       {"at": 0, "u32": 550}, {"at": 4, "text": "7401"}, {"at": 32, "text": "Goulet de Brest"},
       {"at": 296, "u16": 2},
       {"at": 300, "u16": 0}, {"at": 302, "u16": 1}, {"at": 304, "u16": 2}, {"at": 306, "text": "MC"},
       {"at": 308, "i32": 50000}, {"at": 312, "f64": 48.5}, {"at": 320, "f64": 0}, {"at": 336, "text": "Rade"},
       {"at": 428, "u16": 3}, {"at": 430, "u16": 2}, {"at": 432, "u16": 2}, {"at": 434, "text": "PG"},
       {"at": 436, "i32": 10000}, {"at": 440, "f64": 48.25}, {"at": 448, "f64": -4.5},
       {"at": 464, "text": "Port du Chateau"}]},
     "chartIssue": {"size": 64, "fields": [{"at": 21, "date": "2023-03-01"}, {"at": 37, "date": "2021-06-15"}]}}
  ]}]
})";

GUID ObjectId(const ScratchScene& scene, const wchar_t* name) { return ScratchScene::IdOf(scene.Object(name).Get()); }

// A chart installation whose agency table lists 550 (twice: the first row wins) and not
// 170, found through KeyPath as the panel is made.
struct AgencyInstallation {
  ScratchFolder folder;
  SavedRegistryValue keyPath{HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine\\Brdata\\Enum", "KeyPath"};
  AgencyInstallation() {
    REQUIRE(CreateDirectoryA((folder / "SYSTEM").c_str(), nullptr));
    REQUIRE(CreateDirectoryA((folder / "SYSTEM\\HTML").c_str(), nullptr));
    const std::string table = "550;SHOM;Service hydrographique de la marine\r\n550;XX;Later duplicate\r\n"
                              "31;UKHO;United Kingdom Hydrographic Office\r\n";
    std::ofstream(folder / "SYSTEM\\HTML\\hosource.txt", std::ios::binary) << table;
    keyPath.SetString(folder.Path() + "\\");
  }
};

struct MetadataPanel {
  AgencyInstallation installation;
  MountedPanel<cAttrViewPanel_Tbl> m;
};

}  // namespace

TEST_CASE("chart dataset metadata rows, in order, from the header item's record") {
  MetadataPanel fixture;
  auto& m = fixture.m;
  ScratchScene scene(kScene);
  const Names expected{L"DataSet filename\tTESTDS01.000 (TERMINATED)",
                       L"Chart Title\tGoulet de Brest",
                       L"DataSet source type\tOfficial",
                       L"Source identification code\tSHOM 7401",
                       L"Source producing agency\tService hydrographique de la marine",
                       L"Producing agency\t170",
                       L"Scale\t22000",
                       L"Update application date\t02.05.2023",
                       L"Issue date\t15.11.2022",
                       L"Edition number\t3",
                       L"Update number (embedded into ENC)\t4",
                       L"Archive Code\tA7401",
                       L"Horizontal Datum\tWGS 84",
                       L"Horizontal Datum Source\tWGS 84",
                       L"Lon Horizontal Datum Shift\t0.07200'",
                       L"Lat Horizontal Datum Shift\t-0.04800'",
                       L"Vertical Datum\tMean sea level",
                       L"Sounding Datum\tLowest astronomical tide",
                       L"Level\t5",
                       L"Intended usage\t5"};

  SUBCASE("through the database and an object's identity (the header's copy of record 1)") {
    REQUIRE(m.panel.FillDataSetMetadata(scene.Database(L"META").Get(), ObjectId(scene, L"buoy")) == S_OK);
    CHECK(m.Rows() == expected);
  }
  SUBCASE("through the database and the dataset's own identity") {
    REQUIRE(m.panel.FillDataSetMetadata(scene.Database(L"META").Get(), ScratchScene::DataSetIdentity("TESTDS01")) ==
            S_OK);
    CHECK(m.Rows() == expected);
    CHECK(m.Types() == std::vector<int>(expected.size(), cAttrViewPanel_Tbl::kRowAttribute));
  }
}

TEST_CASE("captions come in the host's language") {
  br::test::ScopedEnvironment french(L"CHARTSCENE_LANGUAGE", L"1036");
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillDataSetMetadata(scene.Database(L"META").Get(), ScratchScene::DataSetIdentity("TESTDS01")) ==
          S_OK);
  const Names rows = m.Rows();
  REQUIRE(rows.size() == 20);
  CHECK(rows[0] == L"Nom du fichier du lot de donn\u00E9es\tTESTDS01.000 (ANNUL\u00C9)");
  CHECK(rows[2] == L"Type de source du lot de donn\u00E9es\tOfficiel");
  CHECK(rows[6] == L"\u00C9chelle\t22000");
}

TEST_CASE("library metadata rows; the scale falls back to the file name") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillDataSetMetadata(scene.DataSet(L"LIBBRST").Get(), GUID{}) == S_OK);
  CHECK(m.Rows() == Names{L"Name\tBrest library", L"Description\tHarbour objects", L"Scale\tLIBBRST.LIB",
                          L"Level\t3", L"Source identification code\tLB 1", L"Edition date\t01.03.2024",
                          L"Edition number\t7", L"Depth Height Units\tmetres", L"Sounding Datum\tLAT",
                          L"Vertical Datum\tMSL", L"Horizontal Datum\tWGS 84", L"Projection\tMercator"});
}

TEST_CASE("a raster chart entry: the chart, then its panels under their headings") {
  MetadataPanel fixture;
  auto& m = fixture.m;
  ScratchScene scene(kScene);
  REQUIRE(m.panel.FillDataSetMetadata(scene.DataSet(L"RASTER2").Get(), GUID{}) == S_OK);
  CHECK(m.Rows() == Names{L"Chart\t",
                          L"Chart Number\t7401",
                          L"Chart Title\tGoulet de Brest",
                          L"File Issue Date\t15.06.2021",
                          L"Main Panel (Chart 7401, Service hydrographique de la marine)\t",
                          L"Plan Title\tRade",
                          L"Scale\t50000",
                          L"Sub-Panel Number 1 of 2\t",
                          L"Projection\tMERCATOR\rLatitude: 48\u00B0 30'.000 N\rRotation: 0.0000000",
                          L"Plan #3 (Chart 7401, Service hydrographique de la marine)\t",
                          L"Plan Title\tPort du Chateau",
                          L"Scale\t10000",
                          L"Sub-Panel Number 2 of 2\t",
                          L"Projection\tGNOMONIC\rLatitude: 48\u00B0 15'.000 N\rLongitude: 004\u00B0 30'.000 W"});
  CHECK(m.Types()[0] == cAttrViewPanel_Tbl::kRowHeading);
  CHECK(m.Types()[1] == cAttrViewPanel_Tbl::kRowAttribute);

  std::string text;
  CHECK(FormatDataSetMetadata(scene.DataSet(L"RASTER2").Get(), GUID{}, nullptr, text) == E_NOTIMPL);
}

TEST_CASE("the text form of a dataset's metadata for a zero-prefixed identity") {
  br::test::Apartment apartment;
  AgencyInstallation installation;
  const geo::AgencyTable agencies;
  REQUIRE(agencies.Size() == 3);
  ScratchScene scene(kScene);
  std::string text;
  REQUIRE(FormatDataSetMetadata(scene.Database(L"META").Get(), ScratchScene::DataSetIdentity("TESTDS01"), &agencies,
                                text) == S_OK);
  CHECK(text ==
        "DataSet filename\rTESTDS01.000\r"
        "Source identification code\rSHOM 7401\r"
        "Source producing agency\rService hydrographique de la marine\r"
        "Producing agency\r170\r"
        "Scale\r22000\r"
        "Level\r5\r"
        "Intended usage\r5\r"
        "Update application date\r02.05.2023\r"
        "Issue date\r15.11.2022\r"
        "Edition number\r3\r"
        "Update number (embedded into ENC)\r4\r");

  // A record of 40 bytes: only the fields that end inside it, nothing read past it.
  REQUIRE(FormatDataSetMetadata(scene.Database(L"META").Get(), ScratchScene::DataSetIdentity("SHORT01"), &agencies,
                                text) == S_OK);
  CHECK(text == "Scale\r5000\rLevel\r2\rUpdate application date\r31.01.2024\rEdition number\r1\r");

  REQUIRE(FormatDataSetMetadata(scene.DataSet(L"LIBBRST").Get(), GUID{}, &agencies, text) == S_OK);
  CHECK(text.rfind("Name\rBrest library\rDescription\rHarbour objects\rScale\rLIBBRST.LIB\r", 0) == 0);

  // Without a table every agency shows as its code.
  REQUIRE(FormatDataSetMetadata(scene.Database(L"META").Get(), ScratchScene::DataSetIdentity("TESTDS01"), nullptr,
                                text) == S_OK);
  CHECK(text.find("Source producing agency\r550\rProducing agency\r170\r") != std::string::npos);
}

TEST_CASE("metadata failures: no owner, no dataset, a failing host, a raster entry") {
  MountedPanel<cAttrViewPanel_Tbl> m;
  ScratchScene scene(kScene);
  br::test::SceneProbe probe;
  std::string text = "stale";
  CHECK(m.panel.FillDataSetMetadata(nullptr, GUID{}) == E_INVALIDARG);
  CHECK(FormatDataSetMetadata(nullptr, GUID{}, nullptr, text) == E_INVALIDARG);
  CHECK(text.empty());
  CHECK(m.panel.FillDataSetMetadata(scene.Database(L"META").Get(), ScratchScene::DataSetIdentity("NOSUCH")) ==
        E_FAIL);
  CHECK(FormatDataSetMetadata(scene.Database(L"META").Get(), ScratchScene::DataSetIdentity("NOSUCH"), nullptr,
                              text) == E_FAIL);
  CHECK(m.panel.FillDataSetMetadata(scene.DataSet(L"RASTER1").Get(), GUID{}) == E_FAIL);
  CHECK_FALSE(m.panel.HasContent());

  SUBCASE("no parameters: no rows") {
    probe.SetFault("IGeoDataSet.GetParameters", E_FAIL);
    CHECK(m.panel.FillDataSetMetadata(scene.Database(L"META").Get(), ScratchScene::DataSetIdentity("TESTDS01")) ==
          E_FAIL);
    CHECK_FALSE(m.panel.HasContent());
  }
  SUBCASE("no catalogue texts: the datum rows are left out, the rest stays") {
    probe.SetFault("IGeoCatalog.GetEnumText", E_FAIL);
    REQUIRE(m.panel.FillDataSetMetadata(scene.Database(L"META").Get(),
                                        ScratchScene::DataSetIdentity("TESTDS01")) == S_OK);
    const Names rows = m.Rows();
    CHECK(rows.size() == 16);
    for (const std::wstring& row : rows) CHECK(row.find(L"Datum\t") == std::wstring::npos);
  }
  SUBCASE("no header record: the text form fails, the rows lose only level and usage") {
    probe.SetFault("IGeoDataSet.GetHeader", E_FAIL);
    CHECK(FormatDataSetMetadata(scene.Database(L"META").Get(), ScratchScene::DataSetIdentity("TESTDS01"), nullptr,
                                text) == E_FAIL);
    REQUIRE(m.panel.FillDataSetMetadata(scene.Database(L"META").Get(),
                                        ScratchScene::DataSetIdentity("TESTDS01")) == S_OK);
    const Names rows = m.Rows();
    REQUIRE(rows.size() == 18);
    CHECK(rows[0] == L"DataSet filename\tTESTDS01.000");  // the status is in the record
    CHECK(rows.back() == L"Sounding Datum\tLowest astronomical tide");
  }
  probe.ClearFaults();
}
