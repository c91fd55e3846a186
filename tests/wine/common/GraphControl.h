// What the TidesWindow suites share: the graph's colours, a control made from the built DLL,
// and the picture's positions by the graph's own rules, written out independently of its code.
#pragma once

#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/Canvas.h"
#include "tests/wine/common/FakeTidesPort.h"

#include "BR_Private.h"

#include <vector>

namespace br::test {

// Colours of the initial palette the graph uses.
constexpr COLORREF kFrameColour = RGB(0xC0, 0xC0, 0xC0);     // index 7
constexpr COLORREF kNightColour = RGB(0x80, 0x80, 0x80);     // index 17
constexpr COLORREF kTwilightColour = RGB(0x00, 0x00, 0xFF);  // index 12 (0xFF0000)
constexpr COLORREF kDaylightColour = RGB(0x00, 0x80, 0x80);  // index 5 (0x808000)
constexpr COLORREF kCurveColour = RGB(0x00, 0xFF, 0x00);     // index 10

// 25 hourly heights between 0.5 and 1.0 (a cosine with the M2 period).
std::vector<double> CosineDay();

// Positions by the graph's rules in a 300 x 200 picture without labels, whose plot is
// 284 x 184 pixels from (8, 8): the x of a time of day, and the point k of 25 on a scale.
inline int XOfMinutes(int minutes) { return 8 + minutes * 284 / 1440; }
POINT CurvePoint(int k, double value, double maximum, double minimum);

// Checks every pixel of such a plot's row y: 2-pixel hour lines over the bands, daylight
// [dayFrom, dayTo) over twilight [twilightFrom, twilightTo) over night.
void CheckBandRow(const Canvas& canvas, int y, int dayFrom, int dayTo, int twilightFrom, int twilightTo);

// A TidesWindow from the built DLL, released at the latest at its end.
class GraphControl {
public:
  explicit GraphControl(const DllUnderTest& dll);
  ~GraphControl() { Release(); }
  ITidesWindow* operator->() const { return window_.Get(); }
  ITidesWindow* Get() const { return window_.Get(); }
  HRESULT SetDrawText(long value);
  void Release() { window_.Reset(); }

private:
  ComRef<ITidesWindow> window_;
};

}  // namespace br::test
