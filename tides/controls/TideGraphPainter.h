// Paints the tide graph: frame, night/twilight/daylight bands, hour and height grid with
// labels, and the curve, in the shared palette's colours.
#pragma once

#include "tides/controls/graph/tide_day.h"

#include <windows.h>

#include <string>

namespace br::tides {

struct TideGraphStyle {
  HFONT font = nullptr;  // null: the platform's default GUI font
  bool drawText = true;  // hour and height labels
  std::string format = "%.2f";  // height labels; checked by IsValueLabelFormat
  bool feet = false;     // height labels in feet
  double scaleMax = 0.0; // 0: the day's own highest and lowest heights
  double scaleMin = 0.0;
};

struct TideGraphMargins {
  int left = graph::kPlotGap;
  int bottom = graph::kPlotGap;
};

class TideGraphPainter {
public:
  // Paints into dc over client; without a day only the frame and the night plot. Answers
  // the margins it used (the pointer readout needs the left one).
  static TideGraphMargins Paint(HDC dc, const RECT& client, const graph::TideDay* day, const TideGraphStyle& style);

private:
  static void PaintFrame(HDC dc, const RECT& client, const graph::GraphGeometry& geometry);
  static void PaintGrid(HDC dc, const graph::GraphGeometry& geometry, const TideGraphStyle& style,
                        double maximum, double minimum);
  static void PaintCurve(HDC dc, const graph::GraphGeometry& geometry, const graph::TideDay& day,
                         double maximum, double minimum);
};

}  // namespace br::tides
