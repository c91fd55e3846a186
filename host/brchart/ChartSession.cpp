#include "host/brchart/ChartSession.h"

#include <algorithm>
#include <map>

#include "host/brchart/chart_position.h"

namespace br::brchart {

namespace {

// The display components of the moved scene: the same entries by name.
ChartDisplay Rebind(const chartscene::SceneModel& scene, const ChartDisplay& display) {
  const auto find = [](const auto& items, const auto* wanted) -> decltype(&items.front()) {
    if (!wanted) return nullptr;
    for (const auto& item : items)
      if (item.name == wanted->name) return &item;
    return nullptr;
  };
  ChartDisplay d;
  d.projection = find(scene.projections, display.projection);
  d.colorMap = find(scene.colorMaps, display.colorMap);
  d.palette = find(scene.palettes, display.palette);
  d.presParams = find(scene.presParams, display.presParams);
  return d;
}

}  // namespace

ChartSession::ChartSession(chartscene::SceneModel scene, const ChartDisplay& display)
    : scene_(std::move(scene)),
      display_(Rebind(scene_, display)),
      plan_(PlanChart(scene_, display_)),
      picture_(plan_, BackgroundColour(display_), display_.projection ? display_.projection->width : 0,
               display_.projection ? display_.projection->height : 0) {
  for (const auto& object : scene_.objects)
    if (!object.geometry.empty()) candidates_.push_back(object.name);
}

std::vector<std::size_t> ChartSession::Pick(long x, long y) {
  const RECT reach{x - kPickReach, y - kPickReach, x + kPickReach, y + kPickReach};
  std::map<std::string, std::size_t> index;
  for (std::size_t i = 0; i < scene_.objects.size(); ++i) index[scene_.objects[i].name] = i;
  // What lies on top answers first: the layer drawn last, then what is not drawn at all.
  std::map<std::size_t, int> layer;
  for (const DrawItem& item : plan_) layer[item.object] = item.style.layer;
  picked_.clear();
  for (const std::string& name : host_.HitTest(candidates_, reach)) picked_.push_back(index[name]);
  std::stable_sort(picked_.begin(), picked_.end(), [&](std::size_t a, std::size_t b) {
    const int la = layer.count(a) ? layer[a] : -1;
    const int lb = layer.count(b) ? layer[b] : -1;
    return la > lb;
  });
  picture_.SetHighlighted(std::set<std::size_t>(picked_.begin(), picked_.end()));
  return picked_;
}

bool ChartSession::Select(const std::string& name) {
  for (std::size_t i = 0; i < scene_.objects.size(); ++i) {
    if (scene_.objects[i].name != name) continue;
    picked_.assign(1, i);
    picture_.SetHighlighted({i});
    return true;
  }
  return false;
}

std::string ChartSession::PositionAt(long x, long y) const {
  chartscene::GeoPosition at;
  if (!display_.projection || !PixelToPosition(*display_.projection, x + 0.0, y + 0.0, at)) return "";
  return PositionText(at);
}

std::string ChartSession::PickedText() const {
  if (picked_.empty()) return "nothing here";
  std::string text = std::to_string(picked_.size()) + (picked_.size() == 1 ? " object: " : " objects: ");
  for (std::size_t i = 0; i < picked_.size(); ++i) {
    if (i) text += ", ";
    text += LabelOf(scene_, picked_[i]) + " (" + AcronymOf(scene_, picked_[i]) + ")";
  }
  return text;
}

}  // namespace br::brchart
