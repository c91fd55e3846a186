// Scene files: what a loaded scene holds (header record, parameters, attribute values by
// catalogue type, relations both ways, stored files, identities) and every refusal with
// its line and column, the scene left as it was.
#include <doctest/doctest.h>

#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <set>
#include <string>

#include "frame/geo/dataset_header.h"
#include "host/chartscene/model/S57Catalogue.h"
#include "host/chartscene/model/scene_geometry.h"
#include "host/chartscene/model/scene_loader.h"

using namespace br::chartscene;
namespace fs = std::filesystem;

namespace {

const S57Catalogue& Catalogue() {
  static S57Catalogue catalogue = [] {
    S57Catalogue loaded;
    std::string error;
    const char* folder = std::getenv("BR_S57_FOLDER");
    REQUIRE_MESSAGE(loaded.LoadFolder(folder ? folder : "/usr/share/gdal", error), error);
    return loaded;
  }();
  return catalogue;
}

// A scratch folder with one stored file in it.
struct SceneFolder {
  SceneFolder() {
    path = fs::temp_directory_path() / ("chartscene_test_" + std::to_string(std::rand()));
    fs::create_directories(path / "files");
    std::ofstream(path / "files" / "note.txt", std::ios::binary) << "Leading lights 043\xC2\xB0";
  }
  ~SceneFolder() { fs::remove_all(path); }
  fs::path path;
};

const char* const kScene = R"({
  "format": "chartscene 1",
  "catalogue": {
    "classes": [{"code": 55001, "acronym": "harbr_", "name": "Harbour", "hidden": true}],
    "attributes": [{"code": 57003, "acronym": "csilvl", "name": "Level", "type": "U"}],
    "unprintable": ["SCAMIN"]
  },
  "faults": {"IGeoDatabase.GetName": "0x80004005", "IGeoObject.GetText": 1},
  "databases": [{
    "name": "HARBOUR", "kind": "chart",
    "datasets": [{
      "id": "FR5BR010",
      "header": {"scale": 22000, "level": 5, "edition": 3, "update": 2, "updateDate": "2023-05-02",
                 "issueDate": "2022-11-15T12:00", "agency": 550, "sourceAgency": 540, "sourceId": "SHOM",
                 "terminated": true, "usage": 5},
      "parameters": {"title": "Goulet de Brest", "verticalDatum": 24, "soundingDatum": 23,
                     "horizontalDatum": 2, "30": {"R4": 1.5}},
      "parametersForm": "inVariant",
      "properties": {"2": {"UI2": 7}},
      "objects": [
        {"name": "light", "class": "LIGHTS", "point": [48.3581, -4.5683],
         "attributes": {"COLOUR": [1, 3], "LITCHR": 2, "SIGPER": 4.0, "VALNMR": 15.5, "OBJNAM": "Minou",
                        "CATLIT": 300, "SCAMIN": 50000, "INFORM": null, "SIGGRP": {"I4": 7}},
         "flags": 256, "properties": {"500": 184}, "files": {"note.txt": "files/note.txt"}},
        {"name": "aggregate", "class": "C_AGGR", "primitive": "none", "members": ["light", "beacon"]},
        {"name": "beacon", "class": 7, "area": [[48.35, -4.57], [48.36, -4.57], [48.36, -4.56]]}
      ]
    }]
  }, {
    "name": "MARINER", "kind": "user",
    "datasets": [{"id": "1", "type": "library", "header": {"size": 40}, "parameters": {"count": 12}}]
  }],
  "projections": [{"name": "chart", "kind": "mercator", "centre": [48.35, -4.55], "pixelsPerDegree": 20000,
                   "size": [800, 600]}],
  "palettes": [{"name": "day", "colours": ["#FFFFFF", "#00AAFF"]}],
  "colorMaps": [{"name": "day", "indices": {"21": 1, "2": 0}}],
  "presParams": [{"name": "four", "values": {"0": {"R4": 2}, "2": {"R4": 30}, "3": 0}}]
})";

}  // namespace

TEST_CASE("a scene: header record, parameters, values by catalogue type, relations, files, identities") {
  SceneFolder folder;
  SceneModel scene;
  SceneError error;
  REQUIRE_MESSAGE(LoadScene(kScene, folder.path.string(), Catalogue(), scene, error), error.Text());

  REQUIRE(scene.databases.size() == 2);
  CHECK(scene.databases[0].kindId[0] == 0xDF);  // the chart kind, as it lies in memory
  CHECK(scene.databases[1].kind == DatabaseKind::User);
  CHECK(scene.faults.at("IGeoDatabase.GetName") == 0x80004005u);
  CHECK(scene.faults.at("IGeoObject.GetText") == 1u);

  const SceneDataSetModel& chart = scene.dataSets[0];
  CHECK(chart.id == "FR5BR010");
  const br::geo::DataSetHeader header = br::geo::ParseDataSetHeader(chart.header.data(), chart.header.size());
  CHECK(chart.header.size() == 592);
  CHECK(*header.scale == 22000u);
  CHECK(*header.edition == 3);
  CHECK(*header.sourceAgency == 540u);
  CHECK(*header.status == 1);
  CHECK(*header.fileName == "FR5BR010.000");
  CHECK(*header.sourceId == "SHOM");
  // 2023-05-02 is day 45048 after 1899-12-30, 154253 days after 1601-01-01.
  CHECK(*header.updateDate == 154253ULL * 864000000000ULL);
  CHECK(*header.issueDate == (154253ULL - 168) * 864000000000ULL + 432000000000ULL);
  CHECK(scene.dataSets[1].header.size() == 40);

  REQUIRE(chart.parameters.size() == 34);
  CHECK(chart.parameters[2].text == "FR5BR010.000");
  CHECK(chart.parameters[5].type == TypedValue::Type::Date);
  CHECK(chart.parameters[5].real == 45048.0);
  CHECK((chart.parameters[11].type == TypedValue::Type::I2 && chart.parameters[11].integer == 550));
  CHECK((chart.parameters[27].type == TypedValue::Type::UI1 && chart.parameters[27].integer == 24));
  CHECK((chart.parameters[23].type == TypedValue::Type::I2 && chart.parameters[23].integer == 2));
  CHECK((chart.parameters[30].type == TypedValue::Type::R4 && chart.parameters[30].real == 1.5));
  CHECK(chart.parameters[22].text == "Goulet de Brest");
  CHECK(chart.parameterForm == ParameterForm::InVariant);
  CHECK(chart.properties.at(2).type == TypedValue::Type::UI2);
  CHECK(scene.dataSets[1].parameters.size() == 12);
  CHECK(scene.dataSets[1].type == DataSetType::Library);

  REQUIRE(scene.objects.size() == 3);
  const SceneObjectModel& light = scene.objects[0];
  CHECK(light.classCode == 75);
  CHECK(light.primitive == 1);
  CHECK(light.text == "Minou");
  CHECK(light.properties.at(0).integer == 256);
  CHECK(light.properties.at(500).integer == 184);
  const auto value = [&](long code) {
    for (const SceneAttributeModel& attribute : light.attributes)
      if (attribute.code == code) return attribute.value;
    FAIL("no attribute " << code);
    return TypedValue();
  };
  CHECK(value(75).type == TypedValue::Type::ByteList);
  CHECK(value(75).list == std::vector<unsigned>{1, 3});
  CHECK((value(107).type == TypedValue::Type::UI1 && value(107).integer == 2));
  CHECK(value(142).type == TypedValue::Type::R8);
  CHECK(value(37).type == TypedValue::Type::WordList);  // a list value above 255
  CHECK(value(102).type == TypedValue::Type::Empty);    // null: a missing value
  CHECK(value(141).type == TypedValue::Type::I4);       // typed in the file
  REQUIRE(light.files.size() == 1);
  CHECK(light.files[0].bytes == "Leading lights 043\xC2\xB0");
  CHECK(light.holders == std::vector<std::size_t>{1});
  CHECK(scene.objects[1].members == std::vector<std::size_t>{0, 2});
  CHECK(scene.objects[2].primitive == 3);
  CHECK(scene.objects[2].geometry.size() == 3);

  const auto identity = ObjectIdentity(scene, 2);
  CHECK(identity[0] == 3);
  CHECK(std::string(identity.begin() + 8, identity.end()) == "FR5BR010");
  CHECK(FindObject(scene, identity.data()) == 2);
  const auto own = DataSetIdentity(scene, 1);
  CHECK(std::string(own.begin() + 8, own.end()) == "1.......");
  CHECK(FindDataSet(scene, own.data()) == 1);
  CHECK(FindObject(scene, own.data()) == SIZE_MAX);

  CHECK(scene.catalogue.ClassByCode(55001)->flags == kCatalogueHidden);
  CHECK(scene.catalogue.AttributeByAcronym("SCAMIN")->flags == kCatalogueHidden);
  CHECK(Catalogue().AttributeByAcronym("SCAMIN")->flags == 0);  // the shared catalogue is untouched
  CHECK(scene.palettes[0].colours[1][2] == 0xFF);
  CHECK(scene.colorMaps[0].indices.at(21) == 1);
  CHECK(scene.presParams[0].values.at(0).type == TypedValue::Type::R4);
}

TEST_CASE("refused scenes name the line and column of the fault and leave the scene as it was") {
  struct Row {
    const char* what;
    const char* from;  // replaced in kScene by `to`
    const char* to;
    const char* mark;  // where the fault is: the first place of this text from the change on
    const char* words;
  };
  const Row rows[] = {
      {"JSON", "\"format\": \"chartscene 1\",", "\"format\": \"chartscene 1\"", "\"catalogue\"", "expected ','"},
      {"format", "\"chartscene 1\"", "\"chartscene 2\"", "\"chartscene 2\"", "format"},
      {"unknown key", "\"parametersForm\"", "\"parameterForm\"", "\"parameterForm\"", "unknown key"},
      {"acronym in letter case", "\"LITCHR\": 2", "\"Litchr\": 2", "\"Litchr\"", "unknown attribute"},
      {"class", "\"class\": \"LIGHTS\"", "\"class\": \"LIGHT\"", "\"LIGHT\"", "unknown object class"},
      {"float as text", "\"SIGPER\": 4.0", "\"SIGPER\": \"4\"", "\"4\"", "expected a number"},
      {"enum out of range", "\"LITCHR\": 2", "\"LITCHR\": 70000", "70000", "from 0 to 65535"},
      {"member", "\"beacon\"]", "\"bacon\"]", "\"bacon\"", "unknown object"},
      {"stored file", "\"files/note.txt\"", "\"files/none.txt\"", "\"files/none.txt\"", "cannot read"},
      {"second object name", "{\"name\": \"beacon\"", "{\"name\": \"light\"", "{", "second object"},
      {"dataset id", "\"id\": \"1\"", "\"id\": \"1.2\"", "\"1.2\"", "full stop"},
      {"typed value", "{\"R4\": 1.5}", "{\"R16\": 1.5}", "\"R16\"", "unknown value type"},
      {"date", "\"2022-11-15T12:00\"", "\"2022-02-30T12:00\"", "\"2022-02-30", "date"},
      {"position", "[48.3581, -4.5683]", "[98.3581, -4.5683]", "[98.3581", "out of range"},
      {"fault", "\"0x80004005\"", "\"80004005\"", "\"80004005\"", "HRESULT"},
      {"stream name", "{\"note.txt\":", "{\"notes/note.txt\":", "\"notes/", "stored file name"},
  };
  // Line and column (from 1) of an offset of an ASCII text.
  const auto position = [](const std::string& text, std::size_t offset) {
    int line = 1, column = 1;
    for (std::size_t i = 0; i < offset; ++i) {
      if (text[i] == '\n') {
        ++line;
        column = 1;
      } else {
        ++column;
      }
    }
    return std::pair<int, int>(line, column);
  };
  SceneFolder folder;
  for (const Row& row : rows) {
    INFO(row.what);
    std::string text = kScene;
    const std::size_t at = text.find(row.from);
    REQUIRE(at != std::string::npos);
    text.replace(at, std::strlen(row.from), row.to);
    const std::size_t mark = text.find(row.mark, at);
    REQUIRE(mark != std::string::npos);
    const auto [line, column] = position(text, mark);
    SceneModel scene;
    scene.databases.resize(1);
    scene.databases[0].name = "kept";
    SceneError error;
    REQUIRE_FALSE(LoadScene(text, folder.path.string(), Catalogue(), scene, error));
    CHECK(error.message.find(row.words) != std::string::npos);
    CHECK(error.line == line);
    CHECK(error.column == column);
    CHECK(error.Text().rfind("line " + std::to_string(line) + ", column ", 0) == 0);
    CHECK(scene.databases.size() == 1);
    CHECK(scene.databases[0].name == "kept");
  }
}

TEST_CASE("scene dates and display arithmetic") {
  double days = 0;
  REQUIRE(ParseSceneDate("1899-12-30", days));
  CHECK(days == 0);
  REQUIRE(ParseSceneDate("2024-02-29T18:00:00", days));
  CHECK(days == 45351.75);
  CHECK_FALSE(ParseSceneDate("2023-02-29", days));
  CHECK_FALSE(ParseSceneDate("2023-13-01", days));
  CHECK_FALSE(ParseSceneDate("2023-1-01x", days));

  SceneProjectionModel flat{"flat", false, 48.0, -4.0, 1000, 800, 600};
  const PixelPoint centre = ProjectToPixel(flat, 48.0, -4.0);
  CHECK((centre.x == 400 && centre.y == 300));
  const PixelPoint north = ProjectToPixel(flat, 48.1, -3.9);
  CHECK((north.x == 500 && north.y == 200));
  SceneProjectionModel mercator = flat;
  mercator.mercator = true;
  // One tenth of a degree north at 48 degrees: 1/cos(48.05) of the equator's, 149.6 pixels.
  CHECK(ProjectToPixel(mercator, 48.1, -4.0).y == 300 - 150);

  const PixelRect rect{392, 292, 408, 308};
  CHECK(ShapeHitsRect(1, {{408, 300}}, rect));          // the edge counts
  CHECK_FALSE(ShapeHitsRect(1, {{409, 300}}, rect));
  CHECK(ShapeHitsRect(2, {{380, 280}, {420, 320}}, rect));   // crosses without a vertex inside
  CHECK_FALSE(ShapeHitsRect(2, {{380, 280}, {420, 280}}, rect));
  CHECK(ShapeHitsRect(3, {{0, 0}, {800, 0}, {800, 600}, {0, 600}}, rect));  // holds the rectangle
  CHECK_FALSE(ShapeHitsRect(3, {{0, 0}, {100, 0}, {0, 100}}, rect));
  CHECK_FALSE(ShapeHitsRect(6, {{400, 300}}, rect));
}

TEST_CASE("the sample harbour scene loads whole: every database kind, dataset type and relation it shows") {
  const char* root = std::getenv("BR_SOURCE_DIR");
  REQUIRE(root != nullptr);
  const fs::path file = fs::path(root) / "data" / "harbour" / "harbour.json";
  std::ifstream in(file, std::ios::binary);
  const std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  SceneModel scene;
  SceneError error;
  REQUIRE_MESSAGE(LoadScene(text, file.parent_path().string(), Catalogue(), scene, error), error.Text());
  REQUIRE(scene.databases.size() == 3);
  CHECK(scene.databases[0].kind == DatabaseKind::Chart);
  CHECK(scene.databases[1].kind == DatabaseKind::User);
  CHECK(scene.databases[2].kind == DatabaseKind::Hierarchy);
  std::set<DataSetType> types;
  for (const SceneDataSetModel& dataSet : scene.dataSets) types.insert(dataSet.type);
  CHECK(types.size() == 3);
  std::set<long> classes;
  std::size_t stored = 0;
  for (const SceneObjectModel& object : scene.objects) {
    classes.insert(object.classCode);
    stored += object.files.size();
  }
  // The classes the inspector groups and the legend reads: aids, dangers, areas, routeing,
  // collections, meta objects, magnetic variation, the harbour services and the hierarchy.
  for (long code : {5L, 7L, 12L, 17L, 74L, 75L, 84L, 86L, 153L, 159L, 4L, 20L, 85L, 109L, 13L, 400L, 401L, 81L,
                    300L, 308L, 309L, 312L, 500L, 502L, 53355L, 55001L, 55059L, 55060L, 55500L, 57001L, 57004L}) {
    INFO(code);
    CHECK(classes.count(code) == 1);
  }
  CHECK(stored >= 8);
}
