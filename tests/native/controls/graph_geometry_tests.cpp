#include "tides/controls/graph/graph_geometry.h"

#include <doctest/doctest.h>

#include <cmath>
#include <limits>
#include <vector>

using br::tides::graph::GraphGeometry;
using br::tides::graph::Point;
using br::tides::graph::PointerReading;
using br::tides::graph::Rect;

namespace {

// A 300 x 200 control without labels: both margins 8, plot 284 x 184 at (8, 8).
GraphGeometry Plain() { return GraphGeometry(Rect{0, 0, 300, 200}, 8, 8); }

}  // namespace

TEST_CASE("the plot lies inside the margins: labels widen the left and bottom ones only") {
  const GraphGeometry g = Plain();
  CHECK((g.PlotLeft() == 8 && g.PlotRight() == 292 && g.PlotTop() == 8 && g.PlotBottom() == 192));
  CHECK((g.PlotWidth() == 284 && g.PlotHeight() == 184));
  const GraphGeometry labelled(Rect{0, 0, 400, 250}, 37, 16);
  CHECK((labelled.PlotLeft() == 37 && labelled.PlotBottom() == 234));
  CHECK((labelled.PlotWidth() == 355 && labelled.PlotHeight() == 226));
}

TEST_CASE("times of day, hour lines and height lines") {
  const GraphGeometry g = Plain();
  // 06:30 is 8 + trunc(76.9); hour line 1 is trunc(8 + 11.83); height line 1 is trunc(200 - 36.8 - 8).
  CHECK((g.XOfTime(0, 0) == 8 && g.XOfTime(24, 0) == 292 && g.XOfTime(12, 0) == 150 && g.XOfTime(6, 30) == 84));
  CHECK((g.XOfHourLine(1) == 19 && g.XOfHourLine(12) == 150 && g.XOfHourLine(23) == 280));
  CHECK((g.YOfHeightLine(0) == 192 && g.YOfHeightLine(1) == 155 && g.YOfHeightLine(5) == 8));
  CHECK(g.YOfHeightLabel(1) == 147);
  CHECK(GraphGeometry::HeightOfLine(0, 3.0, -1.0) == -1.0);
  CHECK(GraphGeometry::HeightOfLine(5, 3.0, -1.0) == doctest::Approx(3.0));
  CHECK(GraphGeometry::HeightOfLine(2, 3.0, -1.0) == doctest::Approx(0.6));
}

TEST_CASE("the curve spans the plot from the lowest to the highest value") {
  const GraphGeometry g = Plain();
  std::vector<double> values(25);
  for (int k = 0; k < 25; ++k) values[k] = std::sin(k * 0.5);
  const std::vector<Point> curve = g.Curve(values, 1.0, -1.0);
  REQUIRE(curve.size() == 25);
  CHECK((curve.front().x == 8 && curve.back().x == 292 && curve[3].x == 43));  // trunc(8 + 3 * 284 / 24 = 43.5)
  CHECK(curve.front().y == 100);  // sin 0 = 0 at mid-scale: trunc(192 - 1 * 184 / 2)
  const std::vector<Point> ends = g.Curve({-1.0, 1.0, 0.25}, 1.0, -1.0);
  CHECK((ends[0].y == 192 && ends[1].y == 8 && ends[2].y == 77));  // trunc(192 - 1.25 * 92 = 77)
}

TEST_CASE("a flat scale or a single point draws a flat line at mid-height") {
  const GraphGeometry g = Plain();
  const std::vector<Point> flat = g.Curve({1.0, 1.0, 1.0}, 1.0, 1.0);
  REQUIRE(flat.size() == 3);
  for (const Point& p : flat) CHECK(p.y == 100);
  CHECK(flat[1].x == 150);
  const std::vector<Point> single = g.Curve({0.7}, 2.0, 0.0);
  REQUIRE(single.size() == 2);
  CHECK((single[0].x == 8 && single[1].x == 292 && single[0].y == 100 && single[1].y == 100));
  const double nan = std::numeric_limits<double>::quiet_NaN();
  for (const Point& p : g.Curve({0.0, 1.0}, nan, 0.0)) CHECK(p.y == 100);
  CHECK(g.Curve({}, 1.0, 0.0).empty());
}

TEST_CASE("values far outside the scale stay in a safe pixel range") {
  const GraphGeometry g = Plain();
  const double inf = std::numeric_limits<double>::infinity();
  const std::vector<Point> wild = g.Curve({1e300, -1e300, inf, std::nan("")}, 1.0, 0.0);
  CHECK((wild[0].y < -1000000 && wild[1].y > 1000000 && wild[3].y == 100));
  const std::vector<Point> tiny = g.Curve({1.0, 0.0}, 1e-300, 0.0);
  CHECK(tiny[0].y < 0);
}

TEST_CASE("the pointer reads the time and point under it") {
  const GraphGeometry g = Plain();
  // Left of the plot reads 00:00 and the first point; 1 pixel is 5.07 minutes.
  const int readings[][4] = {{0, 0, 0, 0}, {8, 0, 0, 0}, {9, 0, 5, 0}, {150, 12, 0, 12}, {291, 23, 54, 24}};
  for (const auto& e : readings) {
    CAPTURE(e[0]);
    PointerReading r;
    REQUIRE(g.ReadPointer(static_cast<unsigned>(e[0]), 25, r));
    CHECK((r.hour == e[1] && r.minute == e[2] && r.index == e[3]));
  }
}

TEST_CASE("no reading past the end of the day, without points or without a plot") {
  const GraphGeometry g = Plain();
  PointerReading r;
  CHECK_FALSE(g.ReadPointer(292, 25, r));  // 24:00
  CHECK_FALSE(g.ReadPointer(299, 25, r));  // the strip right of the plot
  CHECK_FALSE(g.ReadPointer(0xFFFF, 25, r));  // x = -1 as an unsigned 16-bit number
  CHECK_FALSE(g.ReadPointer(0x1FFFF, 25, r));  // only the low 16 bits count
  CHECK_FALSE(g.ReadPointer(100, 0, r));
  const GraphGeometry narrow(Rect{0, 0, 12, 50}, 8, 8);  // W = -4
  CHECK_FALSE(narrow.ReadPointer(10, 25, r));
}
