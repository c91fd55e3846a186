#pragma once
// The stand-in's display arithmetic: positions to pixels (Mercator or plate carrée about
// the projection's centre, which lands on the middle of its pixel size) and whether an
// object's shape meets a pixel rectangle.

#include <vector>

#include "host/chartscene/model/scene_model.h"

namespace br::chartscene {

struct PixelPoint {
  long x = 0;
  long y = 0;
};

// Edges included on all four sides.
struct PixelRect {
  long left = 0, top = 0, right = 0, bottom = 0;
};

PixelPoint ProjectToPixel(const SceneProjectionModel& projection, double lat, double lon);

// primitive 1: the point lies in the rectangle; 2: a segment of the line meets it;
// 3: the area and the rectangle overlap (an edge meets it, or one holds the other);
// anything else never hits.
bool ShapeHitsRect(long primitive, const std::vector<PixelPoint>& shape, const PixelRect& rect);

}  // namespace br::chartscene
