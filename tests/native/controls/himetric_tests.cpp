#include "frame/control/himetric.h"

#include <doctest/doctest.h>

#include <cstdint>

using br::control::HimetricFromPixels;
using br::control::PixelsFromHimetric;
using br::control::ScaleRounded;

TEST_CASE("pixels and himetric convert with MulDiv's rounding") {
  CHECK((HimetricFromPixels(300, 96) == 7938 && HimetricFromPixels(-300, 96) == -7938));  // 7937.5 rounds away from 0
  CHECK((HimetricFromPixels(200, 96) == 5292 && HimetricFromPixels(0, 96) == 0));
  CHECK((PixelsFromHimetric(7938, 96) == 300 && PixelsFromHimetric(5292, 96) == 200));
  CHECK((HimetricFromPixels(96, 96) == 2540 && HimetricFromPixels(120, 120) == 2540));
}

TEST_CASE("odd inputs do not divide by zero or overflow") {
  CHECK(HimetricFromPixels(300, 0) == 7938);    // no resolution: 96 per inch
  CHECK(PixelsFromHimetric(7938, -5) == 300);
  CHECK(ScaleRounded(5, 3, 0) == 0);
  CHECK(ScaleRounded(INT32_MAX, 2540, 1) == INT32_MAX);
  CHECK(ScaleRounded(INT32_MIN, 2540, 1) == INT32_MIN);
  CHECK(ScaleRounded(7, 1, -2) == -4);          // -3.5 rounds away from zero
}
