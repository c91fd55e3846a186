#include "tides/controls/TideGraphPainter.h"

#include "tides/controls/graph/label_format.h"
#include "toolkit/core/Palette.h"

#include <algorithm>
#include <cstdio>

namespace br::tides {

namespace {

using graph::GraphGeometry;
using toolkit::Palette;

int TextWidth(HDC dc, const std::string& text) {
  SIZE size{};
  if (!GetTextExtentPoint32A(dc, text.c_str(), static_cast<int>(text.size()), &size)) return 0;
  return size.cx;
}

void WriteText(HDC dc, int x, int y, const std::string& text) {
  TextOutA(dc, x, y, text.c_str(), static_cast<int>(text.size()));
}

graph::Rect ToRect(const RECT& r) { return graph::Rect{r.left, r.top, r.right, r.bottom}; }

}  // namespace

TideGraphMargins TideGraphPainter::Paint(HDC dc, const RECT& client, const graph::TideDay* day,
                                         const TideGraphStyle& style) {
  TideGraphMargins margins;
  if (!day || day->points.empty()) {
    PaintFrame(dc, client, GraphGeometry(ToRect(client), margins.left, margins.bottom));
    return margins;
  }

  const HFONT font = style.font ? style.font : static_cast<HFONT>(GetStockObject(DEFAULT_GUI_FONT));
  const HGDIOBJ oldFont = SelectObject(dc, font);
  const bool automatic = style.scaleMax == 0.0;
  const double maximum = automatic ? day->maxValue : style.scaleMax;
  const double minimum = automatic ? day->minValue : style.scaleMin;
  if (style.drawText) {
    TEXTMETRICA metrics{};
    GetTextMetricsA(dc, &metrics);
    margins.bottom = metrics.tmHeight + metrics.tmDescent;
    const int widest = std::max(TextWidth(dc, graph::FormatValueLabel(style.format, maximum)),
                                TextWidth(dc, graph::FormatValueLabel(style.format, minimum)));
    margins.left = widest + metrics.tmAveCharWidth;
  }
  const GraphGeometry geometry(ToRect(client), margins.left, margins.bottom);

  PaintFrame(dc, client, geometry);
  for (const graph::Band& band : graph::BackgroundBands(day->sun, geometry)) {
    Palette::fill(dc, RECT{band.left, geometry.PlotTop(), band.right, geometry.PlotBottom()}, band.colour);
  }
  PaintGrid(dc, geometry, style, maximum, minimum);
  PaintCurve(dc, geometry, *day, maximum, minimum);
  SelectObject(dc, oldFont);
  return margins;
}

void TideGraphPainter::PaintFrame(HDC dc, const RECT& client, const GraphGeometry& geometry) {
  RECT edge = client;
  DrawEdge(dc, &edge, EDGE_SUNKEN, BF_RECT);
  Palette::fill(dc, RECT{client.left + 1, client.top + 1, client.right - 1, client.bottom - 1}, graph::kFrameColour);
  const graph::Rect plot = geometry.Plot();
  Palette::fill(dc, RECT{plot.left, plot.top, plot.right, plot.bottom}, graph::kNightColour);
}

void TideGraphPainter::PaintGrid(HDC dc, const GraphGeometry& geometry, const TideGraphStyle& style,
                                 double maximum, double minimum) {
  const int oldMode = SetBkMode(dc, TRANSPARENT);
  for (int hour = 1; hour <= 23; ++hour) {
    const int x = geometry.XOfHourLine(hour);
    Palette::fill(dc, RECT{x, geometry.PlotTop(), x + 2, geometry.PlotTop() + geometry.PlotHeight()},
                  graph::kFrameColour);
    if (style.drawText && hour % 3 == 0) {
      char label[8];
      std::snprintf(label, sizeof label, "%2d", hour);
      WriteText(dc, x, geometry.PlotBottom(), label);
    }
  }
  const double factor = style.feet ? graph::kFeetPerMetre : 1.0;
  const int left = geometry.PlotLeft();
  for (int line = 0; line <= 5; ++line) {
    const int y = geometry.YOfHeightLine(line);
    Palette::fill(dc, RECT{left, y, left + geometry.PlotWidth(), y + 2}, graph::kFrameColour);
    if (style.drawText) {
      const double value = GraphGeometry::HeightOfLine(line, maximum, minimum) * factor;
      WriteText(dc, geometry.Client().left + 3, geometry.YOfHeightLabel(line),
                graph::FormatValueLabel(style.format, value));
    }
  }
  SetBkMode(dc, oldMode);
}

void TideGraphPainter::PaintCurve(HDC dc, const GraphGeometry& geometry, const graph::TideDay& day,
                                  double maximum, double minimum) {
  const std::vector<graph::Point> points = geometry.Curve(day.points, maximum, minimum);
  if (points.empty()) return;
  const HPEN pen = CreatePen(PS_SOLID, 3, Palette::colour(graph::kCurveColour));
  const HGDIOBJ oldPen = SelectObject(dc, pen);
  MoveToEx(dc, geometry.PlotLeft(), points.front().y, nullptr);
  for (const graph::Point& point : points) LineTo(dc, point.x, point.y);
  SelectObject(dc, oldPen);
  DeleteObject(pen);
}

}  // namespace br::tides
