#include "host/brchart/chart_plan.h"

#include <algorithm>

namespace br::brchart {

namespace {

using chartscene::SceneModel;

template <typename T>
const T* Named(const std::vector<T>& items, const std::string& name) {
  for (const T& item : items)
    if (item.name == name) return &item;
  return nullptr;
}

template <typename T>
bool Pick(const std::vector<T>& items, const std::string& wanted, const char* kind, const T*& out, std::string& error) {
  if (wanted.empty()) {
    out = items.empty() ? nullptr : &items.front();
    return true;
  }
  out = Named(items, wanted);
  if (!out) error = std::string("the scene has no ") + kind + " " + wanted;
  return out != nullptr;
}

const chartscene::TypedValue* AttributeValue(const SceneModel& scene, std::size_t object, const char* acronym) {
  const auto* entry = scene.catalogue.AttributeByAcronym(acronym);
  if (!entry) return nullptr;
  for (const auto& a : scene.objects[object].attributes)
    if (a.code == entry->code) return &a.value;
  return nullptr;
}

// The shallowest depth of a depth area (DRVAL1), or a large depth when it has none.
double ShallowestDepth(const SceneModel& scene, std::size_t object) {
  using T = chartscene::TypedValue::Type;
  const chartscene::TypedValue* v = AttributeValue(scene, object, "DRVAL1");
  if (!v) return 1e9;
  if (v->type == T::R4 || v->type == T::R8) return v->real;
  if (v->type == T::I1 || v->type == T::I2 || v->type == T::I4 || v->type == T::UI1 || v->type == T::UI2 ||
      v->type == T::UI4)
    return static_cast<double>(v->integer);
  return 1e9;
}

}  // namespace

bool ChooseDisplay(const SceneModel& scene, const ChartOptions& options, ChartDisplay& display, std::string& error) {
  display = ChartDisplay{};
  if (!Pick(scene.projections, options.projection, "projection", display.projection, error)) return false;
  if (!display.projection) {
    error = "the scene has no projection to draw in";
    return false;
  }
  if (!Pick(scene.colorMaps, options.colorMap, "colour map", display.colorMap, error)) return false;
  if (!Pick(scene.presParams, options.presParams, "presentation parameters", display.presParams, error)) return false;
  if (!options.palette.empty()) return Pick(scene.palettes, options.palette, "palette", display.palette, error);
  display.palette = display.colorMap ? Named(scene.palettes, display.colorMap->name) : nullptr;
  if (!display.palette && !scene.palettes.empty()) display.palette = &scene.palettes.front();
  return true;
}

std::vector<DrawItem> PlanChart(const SceneModel& scene, const ChartDisplay& display) {
  std::vector<DrawItem> items;
  if (!display.projection) return items;
  const DepthContours contours = ContoursOf(display.presParams);
  for (std::size_t i = 0; i < scene.objects.size(); ++i) {
    const auto& object = scene.objects[i];
    if (object.geometry.empty()) continue;
    DrawItem item;
    item.object = i;
    item.style = StyleOf(AcronymOf(scene, i), object.primitive);
    if (item.style.mark == Mark::None) continue;
    // An area needs three corners, a line two.
    if (object.primitive == 3 && object.geometry.size() < 3) continue;
    if (object.primitive == 2 && object.geometry.size() < 2) continue;
    if (item.style.byDepth) item.style.colourNumber = DepthColourNumber(ShallowestDepth(scene, i), contours);
    item.colour = ChartColour(display.colorMap, display.palette, item.style.colourNumber, item.style.fixed);
    if (item.style.mark == Mark::Symbol) {
      // A buoy or beacon shows its first colour.
      using T = chartscene::TypedValue::Type;
      const chartscene::TypedValue* colour = AttributeValue(scene, i, "COLOUR");
      if (colour && (colour->type == T::ByteList || colour->type == T::WordList) && !colour->list.empty() &&
          item.style.symbol == Symbol::Circle)
        item.colour = S57Colour(colour->list.front());
    }
    if (item.style.mark == Mark::Symbol) {
      const chartscene::TypedValue* name = AttributeValue(scene, i, "OBJNAM");
      if (name && name->type == chartscene::TypedValue::Type::Text) item.label = name->text;
    }
    for (const auto& p : object.geometry) item.shape.push_back(chartscene::ProjectToPixel(*display.projection, p.lat, p.lon));
    items.push_back(std::move(item));
  }
  std::stable_sort(items.begin(), items.end(),
                   [](const DrawItem& a, const DrawItem& b) { return a.style.layer < b.style.layer; });
  return items;
}

std::string ChartDataSetId(const SceneModel& scene) {
  for (const auto& dataSet : scene.dataSets) {
    if (dataSet.type != chartscene::DataSetType::Vector || dataSet.database >= scene.databases.size()) continue;
    if (scene.databases[dataSet.database].kind != chartscene::DatabaseKind::Chart) continue;
    std::string id = dataSet.id;
    while (!id.empty() && id.back() == '.') id.pop_back();
    return id;
  }
  return "";
}

Rgb BackgroundColour(const ChartDisplay& display) {
  return ChartColour(display.colorMap, display.palette, kDeepWater, Rgb{255, 255, 255});
}

std::string AcronymOf(const SceneModel& scene, std::size_t object) {
  if (object >= scene.objects.size()) return "";
  const auto* entry = scene.catalogue.ClassByCode(scene.objects[object].classCode);
  return entry ? entry->acronym : "";
}

std::string LabelOf(const SceneModel& scene, std::size_t object) {
  if (object >= scene.objects.size()) return "";
  using T = chartscene::TypedValue::Type;
  const chartscene::TypedValue* name = AttributeValue(scene, object, "OBJNAM");
  if (name && name->type == T::Text && !name->text.empty()) return name->text;
  if (!scene.objects[object].text.empty()) return scene.objects[object].text;
  return scene.objects[object].name;
}

}  // namespace br::brchart
