// The graph's arithmetic where the Wine control suites do not reach it (their readout
// covers mid-plot and right-edge pointers, their band rows and curve the usual day).
#include "tides/controls/graph/GraphGeometry.h"

#include <doctest/doctest.h>

#include <cmath>
#include <limits>
#include <vector>

using namespace br::tides::graph;

TEST_CASE("the plot inside the margins; times of day, hour and height lines, the curve and the pointer") {
  const GraphGeometry labelled(Rect{0, 0, 400, 250}, 37, 16);  // labels widen the left and bottom margins only
  CHECK((labelled.PlotLeft() == 37 && labelled.PlotTop() == 8 && labelled.PlotRight() == 392 &&
         labelled.PlotBottom() == 234 && labelled.PlotWidth() == 355 && labelled.PlotHeight() == 226));
  const GraphGeometry g(Rect{0, 0, 300, 200}, 8, 8);  // plot 284 x 184 at (8, 8)
  // 06:30 is 8 + trunc(76.9); hour line 1 is trunc(8 + 11.83); height line 1 is trunc(200 - 36.8 - 8).
  CHECK((g.XOfTime(6, 30) == 84 && g.XOfHourLine(1) == 19 && g.YOfHeightLine(1) == 155 && g.YOfHeightLabel(1) == 147));
  CHECK((GraphGeometry::HeightOfLine(0, 3.0, -1.0) == -1.0 && GraphGeometry::HeightOfLine(2, 3.0, -1.0) == doctest::Approx(0.6)));
  const std::vector<Point> curve = g.Curve({-1.0, 1.0, 0.25}, 1.0, -1.0);
  REQUIRE(curve.size() == 3);
  CHECK((curve[1].x == 150 && curve[0].y == 192 && curve[1].y == 8 && curve[2].y == 77));  // trunc(192 - 1.25 * 92)

  // Left of the plot reads 00:00 and the first point; 1 pixel is 5.07 minutes.
  PointerReading r;
  CHECK((g.ReadPointer(0, 25, r) && r.hour == 0 && r.minute == 0 && r.index == 0));
  CHECK((g.ReadPointer(9, 25, r) && r.hour == 0 && r.minute == 5 && r.index == 0));
  CHECK_FALSE(g.ReadPointer(0xFFFF, 25, r));   // x = -1 as an unsigned 16-bit number
  CHECK_FALSE(g.ReadPointer(0x1FFFF, 25, r));  // only the low 16 bits count
  CHECK_FALSE(g.ReadPointer(100, 0, r));
  CHECK_FALSE(GraphGeometry(Rect{0, 0, 12, 50}, 8, 8).ReadPointer(10, 25, r));  // no plot: W = -4
}

TEST_CASE("a flat scale or a single point draws at mid-height; values far outside stay in a safe range") {
  const GraphGeometry g(Rect{0, 0, 300, 200}, 8, 8);
  const std::vector<Point> single = g.Curve({0.7}, 2.0, 0.0);
  REQUIRE(single.size() == 2);
  CHECK((single[0].x == 8 && single[1].x == 292 && single[0].y == 100 && single[1].y == 100));
  for (const Point& p : g.Curve({0.0, 1.0}, std::nan(""), 0.0)) CHECK(p.y == 100);
  for (const Point& p : g.Curve({1.0, 1.0}, 1.0, 1.0)) CHECK(p.y == 100);
  CHECK(g.Curve({}, 1.0, 0.0).empty());
  const std::vector<Point> wild = g.Curve({1e300, -1e300, std::numeric_limits<double>::infinity(), std::nan("")}, 1.0, 0.0);
  CHECK((wild[0].y < -1000000 && wild[1].y > 1000000 && wild[3].y == 100));
}
