// One chart on the screen: the scene as brchart draws it, the picture, and the chart
// host's objects for picking. Shared by the window and the picture-only run.
#pragma once

#include <windows.h>

#include <cstddef>
#include <memory>
#include <string>
#include <vector>

#include "host/brchart/ChartPicture.h"
#include "host/brchart/SceneClient.h"
#include "host/brchart/chart_plan.h"

namespace br::brchart {

class ChartSession {
public:
  // Half the side of the square a click picks in, in pixels.
  static constexpr long kPickReach = 3;

  ChartSession(chartscene::SceneModel scene, const ChartDisplay& display);

  const chartscene::SceneModel& Scene() const { return scene_; }
  const ChartDisplay& Display() const { return display_; }
  ChartPicture& Picture() { return picture_; }
  SceneClient& Host() { return host_; }

  // The objects at a chart pixel by the host's hit test (scene indices, symbols first, then
  // lines, then areas and the objects the chart does not draw); they become the highlighted ones.
  std::vector<std::size_t> Pick(long x, long y);
  const std::vector<std::size_t>& Picked() const { return picked_; }
  // Selects the object of that scene name alone, as a pick of it would; false when the
  // scene has no such object.
  bool Select(const std::string& name);
  // "48°20.418'N 004°36.990'W" of a chart pixel (UTF-8), "" outside the projection's scale.
  std::string PositionAt(long x, long y) const;
  // "3 objects: Fillettes (BCNLAT), ..." of the last pick (UTF-8).
  std::string PickedText() const;

private:
  chartscene::SceneModel scene_;
  ChartDisplay display_;
  std::vector<DrawItem> plan_;
  ChartPicture picture_;
  SceneClient host_;
  std::vector<std::string> candidates_;  // names of the objects that have a shape
  std::vector<std::size_t> picked_;
};

}  // namespace br::brchart
