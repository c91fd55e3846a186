#include "contours/layout/contour_layout.h"

#include <algorithm>
#include <cstdio>

namespace br::contours {

namespace {

constexpr int kFourShadeZones[] = {0, 1, 2, 3, 4};
constexpr int kTwoShadeZones[] = {0, 1, 4};

int BandHeight(int top, int bottom, int count) { return bottom > top ? (bottom - top) / count : 0; }

}  // namespace

std::vector<Band> LayBands(const ContourScheme& scheme, int top, int bottom) {
  const int* zones = scheme.twoShades ? kTwoShadeZones : kFourShadeZones;
  const int count = scheme.twoShades ? 3 : 5;
  const int height = BandHeight(top, bottom, count);
  const int end = std::max(top, bottom);
  std::vector<Band> bands;
  bands.reserve(count);
  for (int i = 0; i < count; ++i) {
    const int bandTop = top + i * height;
    const int bandBottom = i + 1 == count ? end : bandTop + height;
    bands.push_back({bandTop, bandBottom, zones[i]});
  }
  return bands;
}

std::vector<Boundary> LabelBoundaries(const ContourScheme& scheme, int top, int bottom) {
  std::vector<double> depths;
  if (scheme.twoShades) {
    depths = {scheme.safety};
  } else {
    depths = {scheme.shallow, scheme.safety, scheme.deep};
  }
  const int count = scheme.twoShades ? 3 : 5;
  const int height = BandHeight(top, bottom, count);
  std::vector<Boundary> boundaries;
  for (size_t j = 0; j < depths.size(); ++j)
    boundaries.push_back({top + static_cast<int>(j + 1) * height, DepthLabel(depths[j])});
  return boundaries;
}

std::string DepthLabel(double depth) {
  const int length = std::snprintf(nullptr, 0, "%.1f", depth);
  if (length <= 0) return std::string();
  std::string text(static_cast<size_t>(length) + 1, '\0');
  std::snprintf(text.data(), text.size(), "%.1f", depth);
  text.resize(static_cast<size_t>(length));
  return text;
}

LabelMarks MarkLabel(int left, int right, int y, int textWidth, int textHeight) {
  const int width = right - left;
  LabelMarks marks{};
  marks.boxTop = y - textHeight / 2 - 2;
  marks.boxBottom = y + textHeight / 2 + 1;
  marks.barWidth = std::max(0, (width - textWidth) / 2 - 4);
  marks.leftBarX = left;
  marks.rightBarX = left + (width + textWidth) / 2 + 4;
  marks.barTop = y - 1;
  return marks;
}

}  // namespace br::contours
