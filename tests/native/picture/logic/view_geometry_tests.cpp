#include "picture/logic/view_geometry.h"

#include <doctest/doctest.h>

#include <cmath>
#include <limits>

using namespace br::picture;

TEST_CASE("zoomed extent and line steps") {
  ZoomExtent e;
  SUBCASE("50% of 1000 x 600: 500 x 300, steps 5 and 3") {
    REQUIRE(ExtentAt(1000, 600, 50, e));
    CHECK(e.width == 500);
    CHECK(e.height == 300);
    CHECK(e.lineX == 5);
    CHECK(e.lineY == 3);
  }
  SUBCASE("a 90-pixel-wide image has no horizontal line step at 100%") {
    REQUIRE(ExtentAt(90, 400, 100, e));
    CHECK(e.width == 90);
    CHECK(e.lineX == 0);
    CHECK(e.lineY == 4);
  }
  SUBCASE("integer division rounds down: 125% of 3 x 7") {
    REQUIRE(ExtentAt(3, 7, 125, e));
    CHECK(e.width == 3);
    CHECK(e.height == 8);
  }
  SUBCASE("a zoom of 0 or below, and an extent past 32 bits, are refused and change nothing") {
    e.width = 11;
    CHECK_FALSE(ExtentAt(100, 100, 0, e));
    CHECK_FALSE(ExtentAt(100, 100, -50, e));
    CHECK_FALSE(ExtentAt(4000000000u, 10, 100, e));
    CHECK_FALSE(ExtentAt(100000, 10, 3000000, e));
    CHECK(e.width == 11);
    // The largest extent that still fits.
    REQUIRE(ExtentAt(2147483647u, 1, 100, e));
    CHECK(e.width == 2147483647L);
  }
}

TEST_CASE("scroll bar of one axis and where requests land") {
  SUBCASE("an extent that fits disables the bar") {
    const AxisBar bar = BarFor(300, 300);
    CHECK_FALSE(bar.enabled);
    CHECK(LastPosition(bar) == 0);
    CHECK(ScrollTo(ScrollRequest::LineDown, 0, 3, bar, 0) == 0);
    CHECK(ScrollTo(ScrollRequest::Thumb, 0, 3, bar, 50) == 0);
  }
  const AxisBar bar = BarFor(200, 500);  // range 0..499, page 200
  REQUIRE(bar.enabled);
  CHECK(bar.max == 499);
  CHECK(bar.page == 200);
  SUBCASE("the last position shows the last pixel") {
    CHECK(LastPosition(bar) == 300);
    CHECK(LastPosition(bar) + bar.page - 1 == 499);
  }
  SUBCASE("lines, pages and the thumb, clamped at both ends") {
    CHECK(ScrollTo(ScrollRequest::LineDown, 0, 5, bar, 0) == 5);
    CHECK(ScrollTo(ScrollRequest::LineUp, 3, 5, bar, 0) == 0);
    CHECK(ScrollTo(ScrollRequest::PageDown, 50, 5, bar, 0) == 250);
    CHECK(ScrollTo(ScrollRequest::PageDown, 250, 5, bar, 0) == 300);
    CHECK(ScrollTo(ScrollRequest::PageUp, 250, 5, bar, 0) == 50);
    CHECK(ScrollTo(ScrollRequest::Thumb, 0, 5, bar, 123) == 123);
    CHECK(ScrollTo(ScrollRequest::Thumb, 0, 5, bar, 100000) == 300);
    CHECK(ScrollTo(ScrollRequest::Thumb, 40, 5, bar, -7) == 0);
    CHECK(ScrollTo(ScrollRequest::Other, 40, 5, bar, 0) == 40);
  }
  SUBCASE("a zero line step does nothing") { CHECK(ScrollTo(ScrollRequest::LineDown, 17, 0, bar, 0) == 17); }
  SUBCASE("thumb positions past 16 bits") {
    const AxisBar tall = BarFor(1000, 200000);
    CHECK(ScrollTo(ScrollRequest::Thumb, 0, 2000, tall, 150000) == 150000);
    CHECK(LastPosition(tall) == 199000);
  }
}

TEST_CASE("shading: accepted values, palette numbers and the colour matrix") {
  CHECK(ShadingAccepted(0, 0));
  CHECK(ShadingAccepted(4, -100));
  CHECK(ShadingAccepted(2, 100));
  CHECK_FALSE(ShadingAccepted(5, 10));
  CHECK_FALSE(ShadingAccepted(0, 101));
  CHECK_FALSE(ShadingAccepted(0, -100.5));
  CHECK_FALSE(ShadingAccepted(0, std::nan("")));
  CHECK_FALSE(ShadingAccepted(0, std::numeric_limits<double>::infinity()));

  CHECK(ClampPalette(2) == 2);
  CHECK(ClampPalette(9) == 4);
  CHECK(ClampPalette(0x80000000u) == 0);
  CHECK(ClampPalette(0xFFFFFFFFu) == 0);

  CHECK(BrightnessOf(-100) == doctest::Approx(2.0));
  CHECK(BrightnessOf(0) == doctest::Approx(1.0));
  CHECK(BrightnessOf(75) == doctest::Approx(0.25));
  CHECK(BrightnessOf(100) == doctest::Approx(0.0));

  const ColourMatrix m = MatrixFor(0.25f);
  for (int r = 0; r < 5; ++r)
    for (int c = 0; c < 5; ++c) {
      const float expected = r != c ? 0.0f : (r < 3 ? 0.25f : 1.0f);
      CHECK(m[r][c] == expected);
    }
}

TEST_CASE("source part under a destination rectangle") {
  SUBCASE("at 100% the visible part, widened by a pixel") {
    const SourceRect s = SourceFor(100, 50, 300, 150, 4000, 3000, 100);
    CHECK(s.left == 99);
    CHECK(s.top == 49);
    CHECK(s.right == 301);
    CHECK(s.bottom == 151);
  }
  SUBCASE("at 50% twice as much of the image, cut to its edges") {
    const SourceRect s = SourceFor(0, 0, 400, 300, 500, 400, 50);
    CHECK(s.left == 0);
    CHECK(s.top == 0);
    CHECK(s.right == 500);
    CHECK(s.bottom == 400);
  }
  SUBCASE("past the image: empty") {
    const SourceRect s = SourceFor(600, 0, 700, 100, 500, 400, 100);
    CHECK(s.right <= s.left);
  }
}
