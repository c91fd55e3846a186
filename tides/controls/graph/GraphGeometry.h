// Where the tide graph puts things: the plot rectangle inside the client rectangle and
// its margins, the x of a time of day, the grid lines, the curve's points, and the time
// and point under the pointer. Portable: pixels are plain integers.
#pragma once

#include <cstdint>
#include <vector>

namespace br::tides::graph {

struct Rect {
  int left = 0;
  int top = 0;
  int right = 0;
  int bottom = 0;
};

struct Point {
  int x = 0;
  int y = 0;
};

// Margin kept free right of and above the plot, and the margins without labels.
inline constexpr int kPlotGap = 8;

// The hour and minute under the pointer and the index of the point there. An hour of 24
// or more (the strip right of the plot) is no time of the day: no reading is made of it.
struct PointerReading {
  int hour = 0;
  int minute = 0;
  long index = 0;
};

class GraphGeometry {
public:
  GraphGeometry(const Rect& client, int leftMargin, int bottomMargin) noexcept
      : client_(client), leftMargin_(leftMargin), bottomMargin_(bottomMargin) {}

  const Rect& Client() const noexcept { return client_; }
  int LeftMargin() const noexcept { return leftMargin_; }
  int BottomMargin() const noexcept { return bottomMargin_; }

  int PlotLeft() const noexcept { return client_.left + leftMargin_; }
  int PlotRight() const noexcept { return client_.right - kPlotGap; }
  int PlotTop() const noexcept { return client_.top + kPlotGap; }
  int PlotBottom() const noexcept { return client_.bottom - bottomMargin_; }
  Rect Plot() const noexcept { return Rect{PlotLeft(), PlotTop(), PlotRight(), PlotBottom()}; }
  // W and Hp: may be zero or negative in a window too small for the margins.
  int PlotWidth() const noexcept { return client_.right - client_.left - leftMargin_ - kPlotGap; }
  int PlotHeight() const noexcept { return client_.bottom - client_.top - bottomMargin_ - kPlotGap; }

  // x of a time of day (00:00 at the plot's left, 24:00 at its right).
  int XOfTime(int hour, int minute) const noexcept;
  // x of the hour line h (1..23), 2 pixels wide from there.
  int XOfHourLine(int hour) const noexcept;
  // y of the height line i (0 at the plot's bottom .. 5 at its top), 2 pixels high.
  int YOfHeightLine(int line) const noexcept;
  // Top of the label of height line i.
  int YOfHeightLabel(int line) const noexcept;
  // The value of height line i between minimum and maximum.
  static double HeightOfLine(int line, double maximum, double minimum) noexcept;

  // The curve through values scaled between minimum (plot bottom) and maximum (plot
  // top), spread across the plot's width. One value, or a scale without height
  // (maximum equal to minimum, or not a number), gives a flat line at mid-height.
  std::vector<Point> Curve(const std::vector<double>& values, double maximum, double minimum) const;

  // What the pointer at x (the window's unsigned 16-bit x) points at, for a day of
  // pointCount points; false when it points past the end of the day (hour 24 or more)
  // or there is no plot or no point.
  bool ReadPointer(unsigned pointerX, long pointCount, PointerReading& reading) const noexcept;

private:
  int MidHeight() const noexcept;

  Rect client_;
  int leftMargin_;
  int bottomMargin_;
};

}  // namespace br::tides::graph
