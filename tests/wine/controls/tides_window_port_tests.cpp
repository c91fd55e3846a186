// TidesWindow over a real TidesPort of a station folder: Calculate through the window,
// then the bands at the x positions of the port's own sun times and the curve through
// the port's own heights.
#include "tests/wine/common/station_folder.h"
#include "tests/wine/controls/graph_test_support.h"

#include <doctest/doctest.h>

#include <oleauto.h>

using namespace br::test;

namespace {

int MinutesOf(ITidesPort* port, HRESULT (STDMETHODCALLTYPE ITidesPort::*getter)(double*)) {
  double date = 0.0;
  REQUIRE((port->*getter)(&date) == S_OK);
  SYSTEMTIME time{};
  REQUIRE(VariantTimeToSystemTime(date, &time));
  return time.wHour * 60 + time.wMinute;
}

}  // namespace

TEST_CASE("a calculated day of a real port: sun bands where the port's times say, curve through its heights") {
  // A station at 48.4 N 4.5 W with a mean level of 4 and a 2-unit M2 tide.
  StationFolder folder({{"Harbour", 2903, -270, 0, {{0, 4000, 0}, {29, 2000, 1100}}}});
  DllUnderTest dll;
  ITidesDatabase* database = OpenedDatabase(dll, folder.Path());
  ITidesPort* port = PortAt(database, 0);
  database->Release();

  GraphControl graph(dll);
  REQUIRE(graph->SetPort(port) == S_OK);
  REQUIRE(graph->Calculate(1.0, 45098.0) == S_OK);  // 2023-06-21, hourly
  long count = 0;
  REQUIRE(port->get_NumPoints(&count) == S_OK);
  REQUIRE(count == 25);
  double high = 0.0, low = 0.0;
  REQUIRE(port->get_MaxValue(&high) == S_OK);
  REQUIRE(port->get_MinValue(&low) == S_OK);
  REQUIRE(high > low);
  // A scale that keeps the curve in the plot's upper half, clear of the band row.
  const double maximum = high + 0.01;
  const double minimum = low - 1.2 * (high - low);
  REQUIRE(graph->SetScale(maximum, minimum) == S_OK);
  REQUIRE(graph.SetDrawText(0) == S_OK);
  Canvas canvas(300, 200);
  REQUIRE(DrawControl(graph.Get(), canvas) == S_OK);

  const Layout layout;
  const int twilightBegin = MinutesOf(port, &ITidesPort::get_BeginTwilight);
  const int sunrise = MinutesOf(port, &ITidesPort::get_SunRise);
  const int sunset = MinutesOf(port, &ITidesPort::get_SunSet);
  const int twilightEnd = MinutesOf(port, &ITidesPort::get_EndTwilight);
  INFO("minutes: ", twilightBegin, " ", sunrise, " ", sunset, " ", twilightEnd);
  // A midsummer day at 48 N: dawn before 5, dusk after 19 (universal time at 4.5 W).
  REQUIRE(twilightBegin < sunrise);
  REQUIRE(sunrise < 6 * 60);
  REQUIRE(sunset > 19 * 60);
  REQUIRE(sunset < twilightEnd);
  CheckBandRow(canvas, layout, 137, layout.XOfMinutes(sunrise), layout.XOfMinutes(sunset),
               layout.XOfMinutes(twilightBegin), layout.XOfMinutes(twilightEnd));
  CHECK(canvas.At(layout.XOfMinutes(sunrise) - 1, 137) != kDaylightColour);

  for (long k = 0; k < count; ++k) {
    CAPTURE(k);
    double height = 0.0;
    REQUIRE(port->get_WavePoint(k, &height) == S_OK);
    const POINT p = layout.CurvePoint(static_cast<int>(k), 25, height, maximum, minimum);
    CHECK(canvas.At(p.x, p.y) == kCurveColour);
  }

  graph.Release();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}
