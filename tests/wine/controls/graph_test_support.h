// What the TidesWindow suites share: the graph's colours, a control made from the built
// DLL, and the picture's positions by the graph's own rules (x of a time, hour lines,
// height lines), written out independently of the library's code.
#pragma once

#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/controls/canvas.h"
#include "tests/wine/controls/fake_tides_port.h"

#include "BR_Info.h"
#include "BR_Private.h"

#include <string>
#include <vector>

namespace br::test {

// Colours of the initial palette the graph uses.
constexpr COLORREF kFrameColour = RGB(0xC0, 0xC0, 0xC0);  // index 7
constexpr COLORREF kNightColour = RGB(0x80, 0x80, 0x80);  // index 17
constexpr COLORREF kTwilightColour = RGB(0x00, 0x00, 0xFF);  // index 12 (0xFF0000)
constexpr COLORREF kDaylightColour = RGB(0x00, 0x80, 0x80);  // index 5 (0x808000)
constexpr COLORREF kCurveColour = RGB(0x00, 0xFF, 0x00);  // index 10

// The palette the library starts with.
std::vector<COLORREF> InitialPalette();
// A VARIANT (VT_ARRAY | VT_I4) holding the values from index 0; the caller clears it.
VARIANT PaletteVariant(const std::vector<COLORREF>& values);

// 25 hourly heights between 0.5 and 1.0 (a cosine with the M2 period).
std::vector<double> CosineDay();

// Positions by the graph's rules for a client of width x height with margins.
struct Layout {
  int width = 300;
  int height = 200;
  int left = 8;    // left margin
  int bottom = 8;  // bottom margin

  int W() const { return width - left - 8; }
  int Hp() const { return height - bottom - 8; }
  int PlotBottom() const { return height - bottom; }
  int XOfMinutes(int minutes) const { return left + minutes * W() / 1440; }
  int XOfHours(double hours) const { return XOfMinutes(static_cast<int>(hours * 60.0 + 0.5)); }
  int HourLine(int h) const { return left + h * W() / 24; }
  int HeightLine(int i) const { return static_cast<int>(height - i * Hp() / 5.0 - bottom); }
  bool OnHourLine(int x) const;
  POINT CurvePoint(int k, int count, double value, double maximum, double minimum) const;
};

// The layout of a 300 x 200 graph with labels in font (null: the default GUI font) whose
// scale labels read high and low.
Layout LabelledLayout(HFONT font, const char* high, const char* low);

// Checks every pixel of the plot's row y against the graph's rules: hour lines over the
// bands, daylight [dayFrom, dayTo) over twilight [twilightFrom, twilightTo) over night.
void CheckBandRow(const Canvas& canvas, const Layout& layout, int y, int dayFrom, int dayTo, int twilightFrom,
                  int twilightTo);

// A TidesWindow from the built DLL, ended by Finish().
class GraphControl {
public:
  explicit GraphControl(const DllUnderTest& dll);
  ~GraphControl();
  GraphControl(const GraphControl&) = delete;
  GraphControl& operator=(const GraphControl&) = delete;

  ITidesWindow* operator->() const { return window_; }
  ITidesWindow* Get() const { return window_; }
  HRESULT SetDrawText(long value);
  HRESULT SetFormat(const wchar_t* format);
  HRESULT SetPalette(const VARIANT& palette);
  // Releases the control.
  void Release();

private:
  ITidesWindow* window_ = nullptr;
};

}  // namespace br::test
