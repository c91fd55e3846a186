#include "host/chartscene/model/scene_geometry.h"

#include <algorithm>
#include <cmath>

namespace br::chartscene {

namespace {

constexpr double kPi = 3.14159265358979323846;

// Mercator ordinate in degrees of latitude at the equator's scale.
double MercatorDegrees(double lat) {
  const double limited = std::max(-89.5, std::min(89.5, lat));
  return std::log(std::tan(kPi / 4 + limited * kPi / 360)) * 180 / kPi;
}

bool Inside(const PixelPoint& p, const PixelRect& r) {
  return p.x >= r.left && p.x <= r.right && p.y >= r.top && p.y <= r.bottom;
}

long long Cross(const PixelPoint& o, const PixelPoint& a, const PixelPoint& b) {
  return static_cast<long long>(a.x - o.x) * (b.y - o.y) - static_cast<long long>(a.y - o.y) * (b.x - o.x);
}

bool OnSegment(const PixelPoint& p, const PixelPoint& a, const PixelPoint& b) {
  return std::min(a.x, b.x) <= p.x && p.x <= std::max(a.x, b.x) && std::min(a.y, b.y) <= p.y && p.y <= std::max(a.y, b.y);
}

bool SegmentsMeet(const PixelPoint& a, const PixelPoint& b, const PixelPoint& c, const PixelPoint& d) {
  const long long d1 = Cross(c, d, a), d2 = Cross(c, d, b), d3 = Cross(a, b, c), d4 = Cross(a, b, d);
  if (((d1 > 0 && d2 < 0) || (d1 < 0 && d2 > 0)) && ((d3 > 0 && d4 < 0) || (d3 < 0 && d4 > 0))) return true;
  return (d1 == 0 && OnSegment(a, c, d)) || (d2 == 0 && OnSegment(b, c, d)) || (d3 == 0 && OnSegment(c, a, b)) ||
         (d4 == 0 && OnSegment(d, a, b));
}

bool SegmentMeetsRect(const PixelPoint& a, const PixelPoint& b, const PixelRect& r) {
  if (Inside(a, r) || Inside(b, r)) return true;
  const PixelPoint corners[4] = {{r.left, r.top}, {r.right, r.top}, {r.right, r.bottom}, {r.left, r.bottom}};
  for (int i = 0; i < 4; ++i) {
    if (SegmentsMeet(a, b, corners[i], corners[(i + 1) % 4])) return true;
  }
  return false;
}

// Even-odd rule on the polygon's edges.
bool InsidePolygon(const std::vector<PixelPoint>& polygon, double x, double y) {
  bool inside = false;
  for (std::size_t i = 0, j = polygon.size() - 1; i < polygon.size(); j = i++) {
    const PixelPoint& p = polygon[i];
    const PixelPoint& q = polygon[j];
    if ((p.y > y) != (q.y > y) && x < (q.x - p.x) * (y - p.y) / static_cast<double>(q.y - p.y) + p.x) {
      inside = !inside;
    }
  }
  return inside;
}

}  // namespace

PixelPoint ProjectToPixel(const SceneProjectionModel& projection, double lat, double lon) {
  const double x = (lon - projection.centreLon) * projection.pixelsPerDegree + projection.width / 2.0;
  const double north = projection.mercator ? MercatorDegrees(projection.centreLat) - MercatorDegrees(lat)
                                           : projection.centreLat - lat;
  const double y = north * projection.pixelsPerDegree + projection.height / 2.0;
  const auto clamp = [](double v) { return static_cast<long>(std::llround(std::max(-1e9, std::min(1e9, v)))); };
  return {clamp(x), clamp(y)};
}

bool ShapeHitsRect(long primitive, const std::vector<PixelPoint>& shape, const PixelRect& rect) {
  if (shape.empty() || rect.left > rect.right || rect.top > rect.bottom) return false;
  switch (primitive) {
    case 1:
      return Inside(shape[0], rect);
    case 2:
      for (std::size_t i = 0; i + 1 < shape.size(); ++i) {
        if (SegmentMeetsRect(shape[i], shape[i + 1], rect)) return true;
      }
      return shape.size() == 1 && Inside(shape[0], rect);
    case 3:
      for (std::size_t i = 0; i < shape.size(); ++i) {
        if (SegmentMeetsRect(shape[i], shape[(i + 1) % shape.size()], rect)) return true;
      }
      return InsidePolygon(shape, (rect.left + rect.right) / 2.0, (rect.top + rect.bottom) / 2.0);
    default:
      return false;
  }
}

}  // namespace br::chartscene
