// What brchart draws for a scene, in drawing order, with each shape in pixels of the
// chosen projection and its colour resolved: the Windows side only strokes and fills.
// Portable.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "host/brchart/chart_options.h"
#include "host/brchart/chart_styles.h"
#include "host/chartscene/model/scene_geometry.h"
#include "host/chartscene/model/scene_model.h"

namespace br::brchart {

// The display components of a scene that a chart is drawn with (null where the scene
// has none of that kind).
struct ChartDisplay {
  const chartscene::SceneProjectionModel* projection = nullptr;
  const chartscene::SceneColorMapModel* colorMap = nullptr;
  const chartscene::ScenePaletteModel* palette = nullptr;
  const chartscene::ScenePresParamsModel* presParams = nullptr;
};

// Picks the components the options name (the first of each kind by default; the palette
// named like the colour map, else the first). False with a message when a named one is
// missing or the scene has no projection.
bool ChooseDisplay(const chartscene::SceneModel& scene, const ChartOptions& options, ChartDisplay& display,
                   std::string& error);

struct DrawItem {
  std::size_t object = 0;  // index into the scene's objects
  ClassStyle style;
  Rgb colour;
  std::vector<chartscene::PixelPoint> shape;
  std::string label;  // a point symbol's name (OBJNAM, UTF-8) written beside it; "" for none
};

// Every drawable object, fills first, then outlines, lines and symbols; within a layer in
// scene order. Objects of hidden classes are drawn too: hiding is the inspector's rule.
std::vector<DrawItem> PlanChart(const chartscene::SceneModel& scene, const ChartDisplay& display);

// The id of the dataset the chart shows (its legend's): the first vector dataset of a
// chart database, without the '.' padding; "" when there is none.
std::string ChartDataSetId(const chartscene::SceneModel& scene);

// The sea around everything: the deep-water colour.
Rgb BackgroundColour(const ChartDisplay& display);

// The class acronym of an object ("" when the catalogue does not know its code).
std::string AcronymOf(const chartscene::SceneModel& scene, std::size_t object);
// The object's name for people: its OBJNAM, else its text, else its scene handle.
std::string LabelOf(const chartscene::SceneModel& scene, std::size_t object);

}  // namespace br::brchart
