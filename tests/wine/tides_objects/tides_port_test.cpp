// TidesPort through the built DLL: the day's heights and extremes in published units, sun
// times as date-times, and the Calculated event. Point counts by step are in the native
// engine suite; refusals, null pointers and odd steps and dates in the boundary suite.
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/station_folder.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <cmath>
#include <string>
#include <vector>

using br::test::DllUnderTest;
using br::test::EventSink;
using br::test::StationFolder;
using br::test::TestStation;

namespace {

constexpr double kPi = 3.14159265358979323846;

// Mean level 2.000 and S2 (amplitude 1.000, lag 90 degrees): height 2 + cos(30t - 90) at
// hour t, highest at 3 and 15 h, lowest at 9 and 21 h.
const TestStation kS2Station = {"S2 only", 1200, 0, 0, {{0, 2000, 0}, {36, 1000, 900}}};
const TestStation kConstantStation = {"Constant", 600, 600, -5, {{0, 1234, 0}}};

double S2Height(double hours) { return 2.0 + std::cos((30.0 * hours - 90.0) * kPi / 180.0); }

double Date(int year, int month, int day) {
  SYSTEMTIME st = {};
  st.wYear = static_cast<WORD>(year);
  st.wMonth = static_cast<WORD>(month);
  st.wDay = static_cast<WORD>(day);
  double date = 0;
  REQUIRE(SystemTimeToVariantTime(&st, &date));
  return date;
}

// "hh:mm" of a day-count date-time.
std::string TimeOfDay(double date) {
  SYSTEMTIME st = {};
  REQUIRE(VariantTimeToSystemTime(date, &st));
  char text[8];
  snprintf(text, sizeof text, "%02u:%02u", st.wHour, st.wMinute);
  return text;
}

// Port index of the folder (the database released again: ports outlive it).
ITidesPort* Port(const DllUnderTest& dll, const StationFolder& folder, long index = 0) {
  ITidesDatabase* database = br::test::OpenedDatabase(dll, folder.Path());
  ITidesPort* port = br::test::PortAt(database, index);
  database->Release();
  return port;
}

long Points(ITidesPort* port) {
  long n = -1;
  REQUIRE(port->get_NumPoints(&n) == S_OK);
  return n;
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
  ITidesPort* port = Port(dll, folder);

  REQUIRE(port->Calculate(1.0, 36526.75) == S_OK);
  double date = 0;
  CHECK(port->get_PredictionDate(&date) == S_OK);
  CHECK(date == 36526.0);  // 2000-01-01
  for (long k = 0; k <= 24; ++k) {
    INFO("hour ", k);
    CHECK(Point(port, k) == doctest::Approx(S2Height(k)).epsilon(1e-5));
  }
  // 24:00 of one day is 00:00 of the next.
  const double midnight = Point(port, 24);
  REQUIRE(port->Calculate(1.0, 36527.2) == S_OK);
  CHECK(Point(port, 0) == doctest::Approx(midnight).epsilon(1e-5));

  // Maxima at 3 and 15, minima at 9 and 21: the first is reported.
  REQUIRE(port->Calculate(1.0, 36526.0) == S_OK);
  long index = -1;
  CHECK(port->get_MaxValueIndex(&index) == S_OK);
  CHECK(index == 3);
  CHECK(port->get_MinValueIndex(&index) == S_OK);
  CHECK(index == 9);
  double value = 0;
  CHECK(port->get_MaxValue(&value) == S_OK);
  CHECK(value == doctest::Approx(3.0).epsilon(1e-6));
  CHECK(Point(port, 15) == Point(port, 3));
  CHECK(port->get_MinValue(&value) == S_OK);
  CHECK(value == doctest::Approx(1.0).epsilon(1e-6));

  // (Negative dates and dates the platform cannot convert: the boundary suite.)

  // More than 32767 points: computed to the last one.
  const double step = 0.0005;  // 48001 points
  REQUIRE(port->Calculate(step, 36526.0) == S_OK);
  REQUIRE(Points(port) == 48001);
  for (long k : {0L, 32767L, 32768L, 40000L, 48000L}) {
    INFO("point ", k);
    CHECK(Point(port, k) == doctest::Approx(S2Height(k * step)).epsilon(1e-4));
  }
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

// (The position: GetPort's case in the database suite.)
TEST_CASE("a constant curve: extremes at 0, zone read back sign-extended, ports share the engine") {
  StationFolder folder({kConstantStation, kS2Station});
  DllUnderTest dll;
  ITidesPort* constant = Port(dll, folder, 0);
  ITidesPort* s2 = Port(dll, folder, 1);
  REQUIRE(constant->Calculate(0.5, 36526.0) == S_OK);
  long index = -1;
  CHECK(constant->get_MaxValueIndex(&index) == S_OK);
  CHECK(index == 0);
  CHECK(constant->get_MinValueIndex(&index) == S_OK);
  CHECK(index == 0);
  double max = 0, min = 0;
  constant->get_MaxValue(&max);
  constant->get_MinValue(&min);
  CHECK(max == min);
  CHECK(max == doctest::Approx(1.234).epsilon(1e-6));
  for (long k = 0; k < 49; ++k) CHECK(Point(constant, k) == max);
  long zone = 0;
  CHECK(constant->get_TimeZone(&zone) == S_OK);
  CHECK(zone == -5);

  // Calculating another station leaves this day as it was; recalculating gives the same.
  const double before = Point(constant, 7);
  REQUIRE(s2->Calculate(1.0, 36526.0) == S_OK);
  CHECK(Point(constant, 7) == before);
  REQUIRE(constant->Calculate(0.5, 36526.0) == S_OK);
  CHECK(Point(constant, 7) == before);
  CHECK(Point(s2, 3) == doctest::Approx(3.0).epsilon(1e-6));
  constant->Release();
  s2->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

// Several sinks, and sinks that disconnect: the re-entrancy suite; an event for every
// refused step: the boundary suite.
TEST_CASE("Calculated comes with no arguments and the day already in place") {
  StationFolder folder({kS2Station});
  DllUnderTest dll;
  ITidesPort* port = Port(dll, folder);
  EventSink a(DIID__ITidesPortEvents);
  REQUIRE(a.Connect(port));
  long seen = -1;
  a.onCall = [&] { seen = Points(port); };
  REQUIRE(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(a.calls == 1);
  CHECK(seen == 25);
  CHECK(a.lastId == 1);
  CHECK(a.lastArgumentCount == 0);
  a.Disconnect();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

// The sun times themselves are computed and published in the native engine suite; here
// they come through the port as date-times on the predicted day.
TEST_CASE("sun times arrive as date-times of the predicted day, polar days ending at 23:59") {
  struct Row {
    const char* what;
    std::int16_t latitude;  // minutes
    double date;
    const char* times[4];  // twilight begins, sunrise, sunset, twilight ends
  };
  const Row rows[] = {
      {"equator at the equinox", 0, Date(2000, 3, 20), {"05:19", "06:03", "18:10", "18:55"}},
      {"80 N midsummer: polar day", 4800, Date(2000, 6, 21), {"00:00", "00:00", "23:59", "23:59"}},
  };
  using Getter = HRESULT (STDMETHODCALLTYPE ITidesPort::*)(double*);
  const Getter getters[4] = {&ITidesPort::get_BeginTwilight, &ITidesPort::get_SunRise, &ITidesPort::get_SunSet,
                             &ITidesPort::get_EndTwilight};
  for (const Row& row : rows) {
    INFO(row.what);
    StationFolder folder({{"Sun", row.latitude, 0, 0, {{0, 1000, 0}}}});
    DllUnderTest dll;  // a fresh load: the library opens one folder per load
    ITidesPort* port = Port(dll, folder);
    REQUIRE(port->Calculate(1.0, row.date) == S_OK);
    REQUIRE(Points(port) == 25);
    double day = 0;
    port->get_PredictionDate(&day);
    for (int i = 0; i < 4; ++i) {
      double value = 0;
      REQUIRE((port->*getters[i])(&value) == S_OK);
      CHECK(std::floor(value) == day);
      CHECK(TimeOfDay(value) == row.times[i]);
    }
    port->Release();
    CHECK(dll.CanUnloadNow() == S_OK);
  }
}
