// The usual conversion is the Wine control suite's extent; here the odd inputs.
#include "frame/control/himetric.h"

#include <doctest/doctest.h>

#include <cstdint>

using namespace br;

using namespace control;

TEST_CASE("himetric conversions round away from zero and do not divide by zero or overflow") {
  CHECK((HimetricFromPixels(-300, 96) == -7938 && PixelsFromHimetric(7938, -5) == 300));  // -5 dpi: 96 per inch
  CHECK((HimetricFromPixels(300, 0) == 7938 && ScaleRounded(5, 3, 0) == 0 && ScaleRounded(7, 1, -2) == -4));
  CHECK((ScaleRounded(INT32_MAX, 2540, 1) == INT32_MAX && ScaleRounded(INT32_MIN, 2540, 1) == INT32_MIN));
}
