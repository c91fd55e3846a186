#include "tides/controls/graph/GraphGeometry.h"

#include <cmath>

namespace br::tides::graph {

namespace {

// Pixel coordinates stay far inside the int range and GDI's 27-bit limit, whatever
// values and scales a port or host gives.
constexpr double kCoordinateLimit = 1 << 26;

int Truncate(double value) noexcept {
  if (std::isnan(value)) return 0;
  if (value > kCoordinateLimit) value = kCoordinateLimit;
  if (value < -kCoordinateLimit) value = -kCoordinateLimit;
  return static_cast<int>(value);
}

}  // namespace

int GraphGeometry::XOfTime(int hour, int minute) const noexcept {
  return PlotLeft() + Truncate((60.0 * hour + minute) * PlotWidth() / 1440.0);
}

int GraphGeometry::XOfHourLine(int hour) const noexcept {
  return Truncate(PlotLeft() + static_cast<double>(hour) * PlotWidth() / 24.0);
}

int GraphGeometry::YOfHeightLine(int line) const noexcept {
  return Truncate(client_.bottom - line * static_cast<double>(PlotHeight()) / 5.0 - bottomMargin_);
}

int GraphGeometry::YOfHeightLabel(int line) const noexcept {
  return Truncate(client_.bottom - line * static_cast<double>(PlotHeight()) / 5.0 - kPlotGap - bottomMargin_);
}

double GraphGeometry::HeightOfLine(int line, double maximum, double minimum) noexcept {
  return (maximum - minimum) * 0.2 * line + minimum;
}

int GraphGeometry::MidHeight() const noexcept { return PlotTop() + PlotHeight() / 2; }

std::vector<Point> GraphGeometry::Curve(const std::vector<double>& values, double maximum, double minimum) const {
  std::vector<Point> points;
  const std::size_t count = values.size();
  if (count == 0) return points;
  const double span = maximum - minimum;
  if (count == 1) {
    points.push_back(Point{PlotLeft(), MidHeight()});
    points.push_back(Point{PlotLeft() + PlotWidth(), MidHeight()});
    return points;
  }
  const bool flat = !(span != 0.0) || !std::isfinite(span);
  points.reserve(count);
  const double last = static_cast<double>(count - 1);
  for (std::size_t k = 0; k < count; ++k) {
    const int x = Truncate(PlotLeft() + static_cast<double>(k) * PlotWidth() / last);
    int y = MidHeight();
    if (!flat) {
      const double scaled = PlotBottom() - (values[k] - minimum) * PlotHeight() / span;
      y = std::isnan(scaled) ? MidHeight() : Truncate(scaled);
    }
    points.push_back(Point{x, y});
  }
  return points;
}

bool GraphGeometry::ReadPointer(unsigned pointerX, long pointCount, PointerReading& reading) const noexcept {
  if (pointCount < 1) return false;
  const std::int64_t dx = static_cast<std::int64_t>(pointerX & 0xFFFFu) - leftMargin_;
  if (dx <= 0) {
    reading = PointerReading{0, 0, 0};
    return true;
  }
  if (dx >= client_.right) return false;  // 24:00, which no date holds
  const std::int64_t width = PlotWidth();
  if (width <= 0) return false;
  // hour = dx / (W / 24), minute = the rest of that hour in minutes, index = dx / W * N,
  // in integers so that the edges of the hours come out exact.
  const std::int64_t hour = dx * 24 / width;
  if (hour >= 24) return false;
  const std::int64_t minute = (dx * 24 - hour * width) * 60 / width;
  std::int64_t index = dx * pointCount / width;
  if (index > pointCount - 1) index = pointCount - 1;
  reading = PointerReading{static_cast<int>(hour), static_cast<int>(minute), static_cast<long>(index)};
  return true;
}

}  // namespace br::tides::graph
