#include "contours/layout/contour_layout.h"

#include <doctest/doctest.h>

#include <cmath>
#include <limits>

using namespace br::contours;

namespace {

ContourScheme FourShades() { return ContourScheme{false, 2.0, 10.0, 30.0}; }
ContourScheme TwoShades() { return ContourScheme{true, 2.0, 10.0, 30.0}; }

}  // namespace

TEST_CASE("bands: equal heights, the last one reaching the bottom") {
  SUBCASE("four shades over 100 pixels: five bands of 20") {
    const auto bands = LayBands(FourShades(), 0, 100);
    REQUIRE(bands.size() == 5);
    for (int i = 0; i < 5; ++i) {
      CHECK(bands[i].top == 20 * i);
      CHECK(bands[i].bottom == 20 * (i + 1));
      CHECK(bands[i].zone == i);
    }
  }
  SUBCASE("four shades over 103 pixels: the last band is 23 high") {
    const auto bands = LayBands(FourShades(), 0, 103);
    REQUIRE(bands.size() == 5);
    CHECK(bands[3].bottom == 80);
    CHECK(bands[4].top == 80);
    CHECK(bands[4].bottom == 103);
  }
  SUBCASE("two shades: three bands in the colours 21, 31 and 28") {
    const auto bands = LayBands(TwoShades(), 10, 210);
    REQUIRE(bands.size() == 3);
    CHECK(bands[0].top == 10);
    CHECK(bands[0].bottom == 76);
    CHECK(bands[1].bottom == 142);
    CHECK(bands[2].bottom == 210);
    CHECK(kZoneColourNumbers[bands[0].zone] == 21);
    CHECK(kZoneColourNumbers[bands[1].zone] == 31);
    CHECK(kZoneColourNumbers[bands[2].zone] == 28);
  }
  SUBCASE("fewer pixels than bands: all but the last are empty") {
    const auto bands = LayBands(FourShades(), 0, 3);
    for (int i = 0; i < 4; ++i) CHECK(bands[i].top == bands[i].bottom);
    CHECK(bands[4].top == 0);
    CHECK(bands[4].bottom == 3);
  }
  SUBCASE("an upside-down rectangle gives no height at all") {
    for (const Band& band : LayBands(FourShades(), 50, 10)) CHECK(band.bottom == band.top);
  }
}

TEST_CASE("labelled boundaries") {
  SUBCASE("four shades: shallow, safety and deep on the first three boundaries") {
    const auto boundaries = LabelBoundaries(FourShades(), 0, 200);
    REQUIRE(boundaries.size() == 3);
    CHECK(boundaries[0].y == 40);
    CHECK(boundaries[0].label == "2.0");
    CHECK(boundaries[1].y == 80);
    CHECK(boundaries[1].label == "10.0");
    CHECK(boundaries[2].y == 120);
    CHECK(boundaries[2].label == "30.0");
  }
  SUBCASE("two shades: the safety contour alone, on the first boundary") {
    const auto boundaries = LabelBoundaries(TwoShades(), 0, 103);
    REQUIRE(boundaries.size() == 1);
    CHECK(boundaries[0].y == 34);
    CHECK(boundaries[0].label == "10.0");
  }
}

TEST_CASE("depth labels of any size") {
  CHECK(DepthLabel(0.0) == "0.0");
  CHECK(DepthLabel(-3.25) == "-3.2");
  CHECK(DepthLabel(12.96) == "13.0");
  const std::string huge = DepthLabel(1e300);
  CHECK(huge.size() == 303);
  CHECK(huge.substr(0, 2) == "10");
  CHECK(huge.substr(huge.size() - 2) == ".0");
  CHECK(DepthLabel(std::numeric_limits<double>::quiet_NaN()).find("nan") != std::string::npos);
}

TEST_CASE("label box and bars") {
  SUBCASE("a label in the middle of a 300-pixel view") {
    const LabelMarks marks = MarkLabel(0, 300, 80, 24, 13);
    CHECK(marks.boxTop == 72);
    CHECK(marks.boxBottom == 87);
    CHECK(marks.leftBarX == 0);
    CHECK(marks.barWidth == 134);
    CHECK(marks.rightBarX == 166);
    CHECK(marks.barTop == 79);
  }
  SUBCASE("a label wider than the view: no bars") {
    const LabelMarks marks = MarkLabel(0, 40, 20, 2000, 13);
    CHECK(marks.barWidth == 0);
  }
  SUBCASE("a label that leaves less than the gaps: no bars") {
    CHECK(MarkLabel(0, 30, 20, 24, 13).barWidth == 0);
  }
}
