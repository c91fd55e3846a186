#include <doctest/doctest.h>

#include <cmath>
#include <cstdlib>
#include <map>
#include <string>

#include "host/brchart/chart_plan.h"
#include "host/brchart/chart_scene_file.h"

using namespace br::brchart;
using br::chartscene::SceneModel;

namespace {

const SceneModel& Harbour() {
  static SceneModel scene = [] {
    const char* root = std::getenv("BR_SOURCE_DIR");
    REQUIRE(root != nullptr);
    const char* s57 = std::getenv("BR_S57_FOLDER");
    SceneModel loaded;
    std::string error;
    REQUIRE_MESSAGE(LoadChartScene(std::string(root) + "/data/harbour/harbour.json", s57 ? s57 : "/usr/share/gdal",
                                   loaded, error),
                    error);
    return loaded;
  }();
  return scene;
}

std::size_t ObjectNamed(const SceneModel& scene, const std::string& name) {
  for (std::size_t i = 0; i < scene.objects.size(); ++i)
    if (scene.objects[i].name == name) return i;
  FAIL("no object " << name);
  return 0;
}

const DrawItem* ItemOf(const std::vector<DrawItem>& items, const SceneModel& scene, const std::string& name) {
  const std::size_t object = ObjectNamed(scene, name);
  for (const DrawItem& item : items)
    if (item.object == object) return &item;
  return nullptr;
}

ChartDisplay Display(const ChartOptions& options = {}) {
  ChartDisplay display;
  std::string error;
  REQUIRE_MESSAGE(ChooseDisplay(Harbour(), options, display, error), error);
  return display;
}

}  // namespace

TEST_CASE("the display components: the scene's first, the palette named like the colour map, or as named") {
  const ChartDisplay d = Display();
  CHECK(d.projection->name == "chart");
  CHECK(d.colorMap->name == "day");
  CHECK(d.palette->name == "day");
  CHECK(d.presParams->name == "four-shades");

  ChartOptions other;
  other.projection = "overview";
  other.palette = "dusk";
  other.presParams = "two-shades";
  const ChartDisplay o = Display(other);
  CHECK(o.projection->name == "overview");
  CHECK(o.palette->name == "dusk");
  CHECK(o.presParams->name == "two-shades");

  for (const auto& [field, message] : std::map<std::string, std::string>{
           {"projection", "the scene has no projection mercator"},
           {"palette", "the scene has no palette mercator"},
           {"colorMap", "the scene has no colour map mercator"},
           {"presParams", "the scene has no presentation parameters mercator"}}) {
    ChartOptions wrong;
    (field == "projection" ? wrong.projection : field == "palette" ? wrong.palette
                                               : field == "colorMap" ? wrong.colorMap
                                                                      : wrong.presParams) = "mercator";
    ChartDisplay display;
    std::string error;
    CHECK_FALSE(ChooseDisplay(Harbour(), wrong, display, error));
    CHECK(error == message);
  }
  SceneModel empty;
  ChartDisplay none;
  std::string error;
  CHECK_FALSE(ChooseDisplay(empty, ChartOptions{}, none, error));
  CHECK(error == "the scene has no projection to draw in");
  CHECK(PlanChart(empty, none).empty());
}

TEST_CASE("colours come through the scene's colour map and palette") {
  const ChartDisplay day = Display();
  CHECK(BackgroundColour(day) == Rgb{0xD4, 0xEA, 0xEE});  // 28 -> index 5
  CHECK(ChartColour(day.colorMap, day.palette, 21, Rgb{}) == Rgb{0xC9, 0xED, 0xFC});
  CHECK(ChartColour(day.colorMap, day.palette, 2, Rgb{}) == Rgb{0x4B, 0x9C, 0xD3});
  // Not mapped, no map, no palette: the fallback.
  CHECK(ChartColour(day.colorMap, day.palette, 99, Rgb{1, 2, 3}) == Rgb{1, 2, 3});
  CHECK(ChartColour(nullptr, day.palette, 21, Rgb{1, 2, 3}) == Rgb{1, 2, 3});
  CHECK(ChartColour(day.colorMap, nullptr, 21, Rgb{1, 2, 3}) == Rgb{1, 2, 3});
  // An index past the palette's end.
  br::chartscene::SceneColorMapModel far;
  far.indices[21] = 200;
  CHECK(ChartColour(&far, day.palette, 21, Rgb{4, 5, 6}) == Rgb{4, 5, 6});

  ChartOptions night;
  night.palette = "night";
  CHECK(BackgroundColour(Display(night)) == Rgb{0x1C, 0x24, 0x28});
}

TEST_CASE("depth areas take the colour of their depth zone") {
  const DepthContours c{2.0, 10.0, 30.0};
  CHECK(DepthColourNumber(0.0, c) == 21);
  CHECK(DepthColourNumber(1.99, c) == 21);
  CHECK(DepthColourNumber(2.0, c) == 31);
  CHECK(DepthColourNumber(10.0, c) == 29);
  CHECK(DepthColourNumber(29.9, c) == 29);
  CHECK(DepthColourNumber(30.0, c) == 28);
  CHECK(DepthColourNumber(-5.0, c) == 21);  // drying heights
  CHECK(DepthColourNumber(std::nan(""), c) == 21);

  const DepthContours four = ContoursOf(Display().presParams);
  CHECK((four.shallow == 2.0 && four.safety == 10.0 && four.deep == 30.0));
  CHECK(ContoursOf(nullptr).deep == 30.0);
  // A safety contour outside the others is pulled between them; swapped contours are put right.
  br::chartscene::ScenePresParamsModel odd;
  odd.values[0].type = br::chartscene::TypedValue::Type::R4;
  odd.values[0].real = 50.0;
  odd.values[2].type = br::chartscene::TypedValue::Type::I4;
  odd.values[2].integer = 5;
  odd.values[1].type = br::chartscene::TypedValue::Type::R8;
  odd.values[1].real = 80.0;
  const DepthContours fixed = ContoursOf(&odd);
  CHECK((fixed.shallow == 5.0 && fixed.deep == 50.0 && fixed.safety == 50.0));

  const auto items = PlanChart(Harbour(), Display());
  const DrawItem* depth = ItemOf(items, Harbour(), "depth-area");
  REQUIRE(depth);
  CHECK(depth->style.mark == Mark::Fill);
  CHECK(depth->style.colourNumber == 29);  // DRVAL1 10 m: between safety and deep
  CHECK(depth->colour == Rgb{0x61, 0xB7, 0xFF});  // 29 -> index 4
}

TEST_CASE("the chart plan: what is drawn, how, and in which order") {
  const SceneModel& scene = Harbour();
  const auto items = PlanChart(scene, Display());
  // Meta objects, collections, cartographic areas and objects without geometry stay off the chart.
  for (const char* name : {"magvar", "quality", "accuracy", "system-of-marks", "cartographic-area", "minou-group",
                           "pilot-association", "csi-root"}) {
    CAPTURE(name);
    CHECK(ItemOf(items, scene, name) == nullptr);
  }
  struct Expect {
    const char* name;
    Mark mark;
    int layer;
  };
  const Expect expected[] = {
      {"depth-area", Mark::Fill, 0},        {"built-up", Mark::Fill, 0},         {"anchorage", Mark::Outline, 1},
      {"fish-farm", Mark::Outline, 1},      {"leading-line", Mark::Line, 2},     {"recommended-track", Mark::Line, 2},
      {"minou-lighthouse", Mark::Symbol, 3}, {"minou-light-red", Mark::Symbol, 3}, {"hidden-by-flag", Mark::Symbol, 3},
      {"mariners-note", Mark::Symbol, 3},
  };
  for (const Expect& e : expected) {
    CAPTURE(e.name);
    const DrawItem* item = ItemOf(items, scene, e.name);
    REQUIRE(item);
    CHECK(item->style.mark == e.mark);
    CHECK(item->style.layer == e.layer);
    CHECK(item->shape.size() == scene.objects[item->object].geometry.size());
  }
  for (std::size_t i = 1; i < items.size(); ++i) CHECK(items[i - 1].style.layer <= items[i].style.layer);

  // The projection's centre lands on the middle pixel; buoys and beacons show their first colour.
  const DrawItem* beacon = ItemOf(items, scene, "fillettes-beacon");
  REQUIRE(beacon);
  CHECK(beacon->style.symbol == Symbol::Circle);
  CHECK(beacon->colour == Rgb{220, 0, 0});     // COLOUR [3, 1, 3]: red
  CHECK(ItemOf(items, scene, "kerviniou-buoy")->colour == Rgb{0, 160, 0});  // [4]: green
  CHECK(ItemOf(items, scene, "minou-light-white")->style.symbol == Symbol::Flare);
  // The tidal stream table is drawn where it applies, as a diamond.
  const DrawItem* stream = ItemOf(items, scene, "goulet-stream");
  REQUIRE(stream);
  CHECK(stream->style.symbol == Symbol::Diamond);
  CHECK(stream->style.mark == Mark::Symbol);
  // Named symbols carry their names to be written beside them; areas and unnamed points do not.
  CHECK(beacon->label == "Fillettes");
  CHECK(ItemOf(items, scene, "harbour-entry")->label == "Entr\xC3\xA9" "e du port");
  CHECK(ItemOf(items, scene, "dolphin")->label.empty());
  CHECK(ItemOf(items, scene, "anchorage")->label.empty());
  CHECK(beacon->shape[0].x == 378);  // (-4.5712 + 4.56) * 12000 + 512, rounded
  CHECK(beacon->shape[0].y > 384);   // south of the centre
}

TEST_CASE("labels for people") {
  const SceneModel& scene = Harbour();
  CHECK(LabelOf(scene, ObjectNamed(scene, "minou-lighthouse")) == "Phare du Minou");
  CHECK(LabelOf(scene, ObjectNamed(scene, "dolphin")) == "dolphin");
  CHECK(AcronymOf(scene, ObjectNamed(scene, "fillettes-rock")) == "UWTROC");
  CHECK(AcronymOf(scene, ObjectNamed(scene, "harbour")) == "harbr_");
  CHECK(LabelOf(scene, scene.objects.size()).empty());
  CHECK(AcronymOf(scene, scene.objects.size()).empty());
}

TEST_CASE("the chart's dataset: the first vector dataset of a chart database") {
  CHECK(ChartDataSetId(Harbour()) == "FR5BR010");
  SceneModel scene = Harbour();
  // Only the mariner's database left: no chart dataset.
  scene.databases[0].kind = br::chartscene::DatabaseKind::User;
  CHECK(ChartDataSetId(scene).empty());
  // A short id loses its padding.
  SceneModel padded = Harbour();
  for (auto& d : padded.dataSets)
    if (d.id == "FR5BR010") d.id = "BR12....";
  CHECK(ChartDataSetId(padded) == "BR12");
}

TEST_CASE("a scene that cannot be read says why") {
  SceneModel scene;
  std::string error;
  CHECK_FALSE(LoadChartScene("/nonexistent/chart.json", "/usr/share/gdal", scene, error));
  CHECK(error == "cannot open the scene /nonexistent/chart.json");
  CHECK_FALSE(LoadChartScene("/nonexistent/chart.json", "/nonexistent", scene, error));
  CHECK(error.rfind("the S-57 catalogue in /nonexistent cannot be read", 0) == 0);
  CHECK(FolderOf("C:\\charts\\brest.json") == "C:\\charts");
  CHECK(FolderOf("data/harbour/harbour.json") == "data/harbour");
  CHECK(FolderOf("harbour.json").empty());
}
