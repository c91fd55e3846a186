// Strokes and fills a chart plan into a device context: the sea, depth and land fills,
// outlines, lines and point symbols with their names, and a red ring around the objects picked.
#pragma once

#include <windows.h>

#include <cstddef>
#include <set>
#include <vector>

#include "host/brchart/chart_plan.h"

namespace br::brchart {

class ChartPicture {
public:
  ChartPicture(std::vector<DrawItem> items, Rgb background, long width, long height);

  long Width() const { return width_; }
  long Height() const { return height_; }
  // Objects (scene indices) drawn with a highlight.
  void SetHighlighted(std::set<std::size_t> objects) { highlighted_ = std::move(objects); }
  const std::set<std::size_t>& Highlighted() const { return highlighted_; }

  // Draws the whole chart with its top-left corner at the DC's origin.
  void Draw(HDC dc) const;

private:
  void DrawItem(HDC dc, const br::brchart::DrawItem& item) const;
  void DrawHighlight(HDC dc, const br::brchart::DrawItem& item) const;
  void DrawLabels(HDC dc) const;

  std::vector<br::brchart::DrawItem> items_;
  Rgb background_;
  long width_, height_;
  std::set<std::size_t> highlighted_;
};

}  // namespace br::brchart
