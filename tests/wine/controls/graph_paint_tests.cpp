// TidesWindow's picture, drawn through IViewObject::Draw into memory bitmaps: frame,
// night/twilight/daylight bands, grid, labels and margins, the curve, the palette.
#include "tests/wine/controls/graph_test_support.h"

#include <doctest/doctest.h>

#include <algorithm>
#include <string>

using namespace br::test;

namespace {

// Row 137 lies between height lines 1 (155) and 2 (118), below a curve scaled 0..1 with
// heights of at least 0.5 (y <= 100).
constexpr int kBandRow = 137;

struct Day {
  DllUnderTest dll;
  FakeTidesPort port;
  GraphControl graph{dll};

  explicit Day(std::vector<double> points = CosineDay()) {
    port.points = std::move(points);
    REQUIRE(graph->SetPort(&port) == S_OK);
    REQUIRE(graph->SetScale(1.0, 0.0) == S_OK);
    REQUIRE(graph.SetDrawText(0) == S_OK);
  }
  HRESULT Finish() {
    graph.Release();
    CHECK(port.References() == 0);
    return dll.CanUnloadNow();
  }
};

}  // namespace

TEST_CASE("without a port the frame and the empty night plot are drawn") {
  DllUnderTest dll;
  GraphControl graph(dll);
  Canvas canvas(300, 200);
  REQUIRE(DrawControl(graph.Get(), canvas) == S_OK);
  // The 3-D border's outer ring, in the system's shadow and highlight colours.
  CHECK(canvas.At(0, 100) == GetSysColor(COLOR_BTNSHADOW));
  CHECK(canvas.At(299, 100) == GetSysColor(COLOR_BTNHIGHLIGHT));
  // Margins of 8, no grid, no labels, no curve: the plot is night from edge to edge.
  CHECK(canvas.Count(kNightColour, 8, 8, 292, 192) == 284 * 184);
  CHECK(canvas.Count(kFrameColour, 1, 1, 299, 199) == 298 * 198 - 284 * 184);
  graph.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("a day with all four sun events: bands at the sun times, grid over them, curve on top") {
  Day day;
  Canvas canvas(300, 200);
  REQUIRE(DrawControl(day.graph.Get(), canvas) == S_OK);
  const Layout layout;
  // Twilight 05:30..18:30 and daylight 06:00..18:00 (positions: the native geometry suite).
  CheckBandRow(canvas, layout, kBandRow, layout.XOfHours(6.0), layout.XOfHours(18.0), layout.XOfHours(5.5),
               layout.XOfHours(18.5));

  // The curve in colour 10 through every point, and along each segment.
  const std::vector<double> values = CosineDay();
  for (int k = 0; k < 25; ++k) {
    CAPTURE(k);
    const POINT p = layout.CurvePoint(k, 25, values[k], 1.0, 0.0);
    CHECK(canvas.At(p.x, p.y) == kCurveColour);
    if (k > 0) {
      const POINT q = layout.CurvePoint(k - 1, 25, values[k - 1], 1.0, 0.0);
      CHECK(canvas.Near((p.x + q.x) / 2, (p.y + q.y) / 2, kCurveColour));
    }
  }
  // Three pixels wide: the pen covers the pixels beside the first point's row.
  const POINT first = layout.CurvePoint(0, 25, values[0], 1.0, 0.0);
  CHECK(canvas.At(first.x + 2, first.y + 1) == kCurveColour);
  CHECK(canvas.At(first.x + 2, first.y - 1) == kCurveColour);
  CHECK(canvas.Count(kCurveColour, 0, 110, 300, 200) == 0);
  CHECK(day.Finish() == S_OK);
}

TEST_CASE("draw text 0: no labels, 8-pixel margins, 23 hour lines and 6 height lines") {
  Day day(std::vector<double>(25, 0.65));  // a flat curve at y = 72, clear of every line
  Canvas canvas(300, 200);
  REQUIRE(DrawControl(day.graph.Get(), canvas) == S_OK);
  const Layout layout;
  // Between the border and the plot only frame colour (and the round ends of the curve's
  // 3-pixel pen): no label anywhere.
  const auto frameOrCurve = [&](int left, int top, int right, int bottom) {
    return canvas.Count(kFrameColour, left, top, right, bottom) + canvas.Count(kCurveColour, left, top, right, bottom);
  };
  CHECK(frameOrCurve(1, 1, 8, 199) == 7 * 198);
  CHECK(canvas.Count(kFrameColour, 1, 194, 299, 199) == 298 * 5);
  // 23 hour lines, 2 pixels wide, across the plot's height (none elsewhere on a row: the
  // band-row check); the flat curve crosses each on its rows 71..73.
  for (int h = 1; h <= 23; ++h) {
    CAPTURE(h);
    const int x = layout.HourLine(h);
    CHECK(canvas.Count(kFrameColour, x, 8, x + 2, 192) == 2 * 184 - 6);
    CHECK(canvas.Count(kCurveColour, x, 8, x + 2, 192) == 6);
  }
  // 6 height lines, 2 pixels high, across the plot's width (rows: the native geometry suite).
  for (int i = 0; i <= 5; ++i) {
    CAPTURE(i);
    CHECK(canvas.Count(kFrameColour, 8, layout.HeightLine(i), 292, layout.HeightLine(i) + 2) == 2 * 284);
  }
  CHECK(day.Finish() == S_OK);
}

// Which bands the other combinations of sun events give, and the flat line of a flat
// scale or a one-point day, are worked out in the native graph suites.

TEST_CASE("labels: margins from the font's measures, value labels left, hour labels at 3, 6, ..., 21") {
  Day day;
  REQUIRE(day.graph.SetDrawText(1) == S_OK);
  Canvas canvas(300, 200);
  REQUIRE(DrawControl(day.graph.Get(), canvas) == S_OK);

  // The margins the default GUI font gives labels "0.00" .. "1.00".
  const Layout layout = LabelledLayout(nullptr, "1.00", "0.00");
  CAPTURE(layout.left);
  CAPTURE(layout.bottom);
  REQUIRE(layout.left > 8);

  const int clear = layout.HourLine(1) + 4;  // no hour label before 3 o'clock
  CHECK(canvas.At(clear, layout.PlotBottom() - 1) == kNightColour);
  CHECK(canvas.Count(kFrameColour, layout.HourLine(1), layout.PlotBottom() + 2, layout.HourLine(3), 199) ==
        (layout.HourLine(3) - layout.HourLine(1)) * (199 - layout.PlotBottom() - 2));
  CheckBandRow(canvas, layout, kBandRow, layout.XOfHours(6.0), layout.XOfHours(18.0), layout.XOfHours(5.5),
               layout.XOfHours(18.5));
  // Text (not frame colour) under each hour line 3, 6, ..., 21 and in the left margin.
  for (int h = 3; h <= 21; h += 3) {
    CAPTURE(h);
    const int x = layout.HourLine(h);
    const int area = 8 * (199 - layout.PlotBottom() - 2);
    CHECK(canvas.Count(kFrameColour, x, layout.PlotBottom() + 2, x + 8, 199) < area);
  }
  CHECK(canvas.Count(kFrameColour, 1, 1, layout.left, layout.PlotBottom()) <
        (layout.left - 1) * (layout.PlotBottom() - 1));
  CHECK(day.Finish() == S_OK);
}

TEST_CASE("feet labels through IUnitsOption keep the margins and change the value labels") {
  Day day;
  REQUIRE(day.graph.SetDrawText(1) == S_OK);
  REQUIRE(day.graph.SetFormat(L"%.0f") == S_OK);
  REQUIRE(day.graph->SetScale(10.0, 0.0) == S_OK);
  IUnitsOption* units = Query<IUnitsOption>(day.graph.Get());
  CHECK(units->SetOption(12345) == S_OK);

  Canvas metres(300, 200);
  REQUIRE(DrawControl(day.graph.Get(), metres) == S_OK);
  VARIANT feet;
  VariantInit(&feet);
  feet.vt = VT_BSTR;
  feet.bstrVal = SysAllocString(L"1");  // converted to a number
  CHECK(units->SetUnits(feet) == S_OK);
  VariantClear(&feet);
  Canvas inFeet(300, 200);
  REQUIRE(DrawControl(day.graph.Get(), inFeet) == S_OK);
  feet.vt = VT_I2;
  feet.iVal = 0;
  CHECK(units->SetUnits(feet) == S_OK);
  Canvas metresAgain(300, 200);
  REQUIRE(DrawControl(day.graph.Get(), metresAgain) == S_OK);
  units->Release();

  CHECK_FALSE(metres.SamePixels(inFeet));
  CHECK(metres.SamePixels(metresAgain));
  // The plot did not move: only the labels (10 m = 33 ft) differ.
  for (int x = 40; x < 292; ++x) {
    if (metres.At(x, kBandRow) != inFeet.At(x, kBandRow)) FAIL("plot differs at x = " << x);
  }
  CHECK(day.Finish() == S_OK);
}

TEST_CASE("the automatic scale spans the day's lowest and highest heights") {
  Day day;
  REQUIRE(day.graph->SetScale(0.0, -1.0) == S_OK);
  Canvas canvas(300, 200);
  REQUIRE(DrawControl(day.graph.Get(), canvas) == S_OK);
  const std::vector<double> values = CosineDay();
  const auto [low, high] = std::minmax_element(values.begin(), values.end());
  const Layout layout;
  const int kHigh = static_cast<int>(high - values.begin());
  const int kLow = static_cast<int>(low - values.begin());
  CHECK(canvas.Near(layout.CurvePoint(kHigh, 25, *high, *high, *low).x, 8, kCurveColour));
  CHECK(canvas.Near(layout.CurvePoint(kLow, 25, *low, *high, *low).x, 191, kCurveColour));
  CHECK(day.Finish() == S_OK);
}

TEST_CASE("a palette given through IEmbeddedControl recolours every band of every control") {
  Day day;
  FakeTidesPort otherPort;
  otherPort.points = CosineDay();
  GraphControl other(day.dll);
  REQUIRE(other->SetPort(&otherPort) == S_OK);
  REQUIRE(other->SetScale(1.0, 0.0) == S_OK);
  REQUIRE(other.SetDrawText(0) == S_OK);

  std::vector<COLORREF> palette = InitialPalette();
  palette[7] = RGB(0x20, 0x30, 0x40);
  palette[17] = RGB(0xC8, 0x00, 0x00);
  palette[12] = RGB(0xC8, 0xC8, 0x00);
  palette[5] = RGB(0xC8, 0x00, 0xC8);
  palette[10] = RGB(0x00, 0x64, 0xC8);
  VARIANT fresh = PaletteVariant(palette);
  CHECK(day.graph.SetPalette(fresh) == S_OK);
  VariantClear(&fresh);

  Canvas canvas(300, 200);
  REQUIRE(DrawControl(other.Get(), canvas) == S_OK);  // the other control is recoloured too
  const Layout layout;
  CHECK(canvas.At(40, kBandRow) == palette[17]);
  CHECK(canvas.At(75, kBandRow) == palette[12]);
  CHECK(canvas.At(100, kBandRow) == palette[5]);
  CHECK(canvas.At(4, 100) == palette[7]);
  const POINT first = layout.CurvePoint(0, 25, CosineDay()[0], 1.0, 0.0);
  CHECK(canvas.At(first.x, first.y) == palette[10]);

  // (Arrays of other shapes are refused in the boundary suite.)
  // A reference to an array is taken too: back to the first colours.
  VARIANT initial = PaletteVariant(InitialPalette());
  VARIANT byReference;
  VariantInit(&byReference);
  byReference.vt = VT_ARRAY | VT_I4 | VT_BYREF;
  byReference.pparray = &initial.parray;
  CHECK(day.graph.SetPalette(byReference) == S_OK);
  VariantClear(&initial);
  Canvas restored(300, 200);
  REQUIRE(DrawControl(other.Get(), restored) == S_OK);
  CHECK(restored.At(40, kBandRow) == kNightColour);

  other.Release();
  CHECK(otherPort.References() == 0);
  CHECK(day.Finish() == S_OK);
}

TEST_CASE("drawing at an offset paints the same picture inside the bounds and nothing outside") {
  Day day;
  Canvas atOrigin(300, 200);
  REQUIRE(DrawControl(day.graph.Get(), atOrigin) == S_OK);
  const COLORREF marker = RGB(0x12, 0x34, 0x56);
  Canvas large(400, 300, marker);
  REQUIRE(DrawControl(day.graph.Get(), large, RECT{50, 40, 350, 240}) == S_OK);
  int differing = 0;
  for (int y = 0; y < 200; ++y)
    for (int x = 0; x < 300; ++x)
      if (large.At(x + 50, y + 40) != atOrigin.At(x, y)) ++differing;
  CHECK(differing == 0);
  CHECK(large.Count(marker, 0, 0, 400, 300) == 400 * 300 - 300 * 200);
  CHECK(day.Finish() == S_OK);
}
