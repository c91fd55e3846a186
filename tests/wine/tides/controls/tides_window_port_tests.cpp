// TidesWindow over a real TidesPort of a station folder: Calculate through the window,
// then the bands at the x positions of the port's own sun times and the curve through
// the port's own heights.
#include "tests/wine/common/StationFolder.h"
#include "tests/wine/common/GraphControl.h"

#include <doctest/doctest.h>

#include <oleauto.h>

using namespace br::test;

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
  REQUIRE(count == 25);  // the window's Calculate reached the port
  double high = 0.0, low = 0.0;
  REQUIRE(port->get_MaxValue(&high) == S_OK);
  REQUIRE(port->get_MinValue(&low) == S_OK);
  // A scale that keeps the curve in the plot's upper half, clear of the band row.
  const double maximum = high + 0.01;
  const double minimum = low - 1.2 * (high - low);
  REQUIRE(graph->SetScale(maximum, minimum) == S_OK);
  REQUIRE(graph.SetDrawText(0) == S_OK);
  Canvas canvas(300, 200);
  REQUIRE(DrawControl(graph.Get(), canvas) == S_OK);

  int minutes[4] = {}, i = 0;  // twilight begins, sunrise, sunset, twilight ends
  for (auto getter : {&ITidesPort::get_BeginTwilight, &ITidesPort::get_SunRise, &ITidesPort::get_SunSet,
                      &ITidesPort::get_EndTwilight}) {
    double date = 0.0;
    SYSTEMTIME time{};
    REQUIRE((port->*getter)(&date) == S_OK);
    REQUIRE(VariantTimeToSystemTime(date, &time));
    minutes[i++] = time.wHour * 60 + time.wMinute;
  }
  // (Which times a day has: the native sun-event suite.)
  CheckBandRow(canvas, 137, XOfMinutes(minutes[1]), XOfMinutes(minutes[2]), XOfMinutes(minutes[0]),
               XOfMinutes(minutes[3]));
  for (long k = 0; k < count; ++k) {
    CAPTURE(k);
    double height = 0.0;
    REQUIRE(port->get_WavePoint(k, &height) == S_OK);
    const POINT p = CurvePoint(static_cast<int>(k), height, maximum, minimum);
    CHECK(canvas.At(p.x, p.y) == kCurveColour);
  }
  graph.Release();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}
