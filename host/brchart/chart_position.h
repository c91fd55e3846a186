// Pixels of a scene projection back to positions, and positions as the status line shows
// them. The forward direction is the stand-in host's (scene_geometry.h). Portable.
#pragma once

#include <string>

#include "host/chartscene/model/scene_model.h"

namespace br::brchart {

// The position at the centre of pixel (x, y) of the projection; the inverse of
// ProjectToPixel up to its rounding. False for a projection without scale.
bool PixelToPosition(const chartscene::SceneProjectionModel& projection, double x, double y,
                     chartscene::GeoPosition& position);

// "48°20.418'N 004°36.990'W": degrees and minutes with three decimals, in UTF-8.
std::string PositionText(const chartscene::GeoPosition& position);

}  // namespace br::brchart
