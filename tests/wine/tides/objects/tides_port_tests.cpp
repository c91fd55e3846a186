// TidesPort through the built DLL: the day's heights and extremes in published units, a
// sunset after midnight and damaged headers. Point counts by step and other sun times: the
// native engine suite and tides_example_check.js; the Calculated event: the re-entrancy
// suite; refusals and odd steps and dates: the boundary suite.
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/StationFolder.h"

#include <cmath>

using namespace br::test;

namespace {

// Mean level 2.000 and S2 (amplitude 1.000, lag 90 degrees): height 2 + cos(30t - 90) at
// hour t, highest at 3 and 15 h, lowest at 9 and 21 h.
const TestStation kS2Station = {"S2 only", 1200, 0, 0, {{0, 2000, 0}, {36, 1000, 900}}};

double S2Height(double hours) { return 2.0 + std::cos((30.0 * hours - 90.0) * 3.14159265358979323846 / 180.0); }

template <class T>
T Get(ITidesPort* port, HRESULT (STDMETHODCALLTYPE ITidesPort::*getter)(T*)) {
  T v = 0;
  REQUIRE((port->*getter)(&v) == S_OK);
  return v;
}
double Point(ITidesPort* port, long k) {
  double v = 0;
  REQUIRE(port->get_WavePoint(k, &v) == S_OK);
  return v;
}

}  // namespace

TEST_CASE("the day: whole-day truncation, heights at local midnight + k x step, first of tied extremes") {
  StationFolder folder({kS2Station});
  DllUnderTest dll;
  ITidesDatabase* database = OpenedDatabase(dll, folder.Path());
  ITidesPort* port = PortAt(database, 0);
  database->Release();  // ports outlive it
  REQUIRE(port->Calculate(1.0, 36526.75) == S_OK);
  CHECK(Get(port, &ITidesPort::get_PredictionDate) == 36526.0);  // 2000-01-01
  for (long k = 0; k <= 24; ++k) CHECK(Point(port, k) == doctest::Approx(S2Height(k)).epsilon(1e-5));
  const double midnight = Point(port, 24);  // 24:00 of one day is 00:00 of the next
  REQUIRE(port->Calculate(1.0, 36527.2) == S_OK);
  CHECK(Point(port, 0) == doctest::Approx(midnight).epsilon(1e-5));

  // Maxima at 3 and 15, minima at 9 and 21: the first is reported.
  REQUIRE(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(Get(port, &ITidesPort::get_MaxValueIndex) == 3);
  CHECK(Get(port, &ITidesPort::get_MinValueIndex) == 9);
  CHECK(Get(port, &ITidesPort::get_MaxValue) == doctest::Approx(3.0).epsilon(1e-6));
  CHECK(Get(port, &ITidesPort::get_MinValue) == doctest::Approx(1.0).epsilon(1e-6));

  // More than 32767 points: computed to the last one.
  const double step = 0.0005;  // 48001 points
  REQUIRE(port->Calculate(step, 36526.0) == S_OK);
  REQUIRE(Points(port) == 48001);
  for (long k : {32767L, 32768L, 48000L}) CHECK(Point(port, k) == doctest::Approx(S2Height(k * step)).epsilon(1e-4));
  port->Release();
}

TEST_CASE("a damaged header gives no day; a sunset after midnight puts no missing twilight before the sunrise") {
  // Reykjavik (64 09'N 21 56'W, zone 0) at midsummer, then headers no station has: a zone
  // of UTC-127 hours and one of UTC+15.
  StationFolder folder({{"Reykjavik", 3849, -1316, 0, {{0, 2000, 0}, {29, 1500, 900}}},
                        {"Far zone", 600, 0, 127, {{0, 2000, 0}}},
                        {"Past Kiribati", 660, 0, -15, {{0, 2000, 0}}}});
  DllUnderTest dll;
  ITidesDatabase* database = OpenedDatabase(dll, folder.Path());
  ITidesPort* reykjavik = PortAt(database, 0);
  const double midsummer = 46194.0;  // 2026-06-21
  REQUIRE(reykjavik->Calculate(1.0, midsummer) == S_OK);
  REQUIRE(Points(reykjavik) == 25);
  const auto minutes = [&](HRESULT (STDMETHODCALLTYPE ITidesPort::*getter)(double*)) {
    return static_cast<long>(std::lround((Get(reykjavik, getter) - midsummer) * 1440.0));
  };
  CHECK(minutes(&ITidesPort::get_SunRise) == 2 * 60 + 55);
  CHECK(minutes(&ITidesPort::get_SunSet) == 4);  // the next day's 00:04, as a time of this day
  // No twilight: the morning one at the sunrise (it read 00:00, a twilight at midnight),
  // the evening one at the sunset's hour.
  CHECK(minutes(&ITidesPort::get_BeginTwilight) == 2 * 60 + 55);
  CHECK(minutes(&ITidesPort::get_EndTwilight) == 0);
  reykjavik->Release();

  for (long damaged : {1L, 2L}) {
    BSTR name = nullptr;
    double latitude = 0, longitude = 0;
    REQUIRE(database->GetPortInfo(damaged, &latitude, &longitude, &name) == S_OK);
    CHECK(SysStringLen(name) == 0);
    SysFreeString(name);
    ITidesPort* port = PortAt(database, damaged);
    CHECK(port->Calculate(1.0, midsummer) == S_OK);
    CHECK(Points(port) == 0);
    port->Release();
  }
  database->Release();
}
