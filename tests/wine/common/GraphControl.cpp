#include "tests/wine/common/GraphControl.h"

#include <doctest/doctest.h>

#include <cmath>

namespace br::test {

std::vector<double> CosineDay() {
  std::vector<double> values(25);
  for (int k = 0; k < 25; ++k) values[k] = 0.75 + 0.25 * std::cos(2.0 * 3.141592653589793 * k / 12.4206);
  return values;
}

POINT CurvePoint(int k, double value, double maximum, double minimum) {
  const double y = 192 - (value - minimum) * 184 / (maximum - minimum);
  return POINT{static_cast<int>(8 + k * 284.0 / 24), static_cast<int>(y)};
}

void CheckBandRow(const Canvas& canvas, int y, int dayFrom, int dayTo, int twilightFrom, int twilightTo) {
  int wrong = 0;
  for (int x = 8; x < 292; ++x) {
    COLORREF expected = x >= dayFrom && x < dayTo               ? kDaylightColour
                        : x >= twilightFrom && x < twilightTo ? kTwilightColour
                                                                : kNightColour;
    for (int h = 1; h <= 23; ++h)
      if (x >= 8 + h * 284 / 24 && x < 8 + h * 284 / 24 + 2) expected = kFrameColour;
    if (canvas.At(x, y) != expected && ++wrong <= 5) {
      CAPTURE(x);
      CHECK(canvas.At(x, y) == expected);
    }
  }
  CHECK(wrong == 0);
}

GraphControl::GraphControl(const DllUnderTest& dll) { REQUIRE(dll.Create(CLSID_TidesWindow, window_.Out()) == S_OK); }

HRESULT GraphControl::SetDrawText(long value) {
  VARIANT v;
  VariantInit(&v);
  v.vt = VT_I4;
  v.lVal = value;
  return window_->put_Property(TW_DRAWTEXT, v);
}

}  // namespace br::test
