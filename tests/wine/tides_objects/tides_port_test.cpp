// TidesPort through the built DLL: the state machine, Calculate and its edge cases,
// extremes, published heights, sun times and the Calculated event.
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/station_folder.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <cmath>
#include <limits>
#include <string>
#include <vector>

using br::test::DllUnderTest;
using br::test::EventSink;
using br::test::StationFolder;
using br::test::TestStation;

namespace {

constexpr double kPi = 3.14159265358979323846;
constexpr std::int16_t kS2 = 36;

// Mean level 2.000 and S2 of amplitude 1.000 with phase lag 90 degrees: with local
// midnight at 00:00 UT the height at hour t is 2 + cos(30t - 90) degrees: highest at 3 and
// 15 h, lowest at 9 and 21 h.
const TestStation kS2Station = {"S2 only", 1200, 0, 0, {{0, 2000, 0}, {kS2, 1000, 900}}};
const TestStation kConstantStation = {"Constant", 600, 600, -5, {{0, 1234, 0}}};

double Date(int year, int month, int day, int hour = 0, int minute = 0) {
  SYSTEMTIME st = {};
  st.wYear = static_cast<WORD>(year);
  st.wMonth = static_cast<WORD>(month);
  st.wDay = static_cast<WORD>(day);
  st.wHour = static_cast<WORD>(hour);
  st.wMinute = static_cast<WORD>(minute);
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

// The one database of the loaded DLL, opened on a folder, and its ports.
class Stations {
public:
  Stations(const DllUnderTest& dll, const StationFolder& folder) {
    REQUIRE(dll.Create(CLSID_TidesDatabase, &database_) == S_OK);
    BSTR path = SysAllocString(folder.Path().c_str());
    REQUIRE(database_->Initialize(path) == S_OK);
    SysFreeString(path);
  }
  ~Stations() { database_->Release(); }

  ITidesPort* Port(long index) {
    IUnknown* unknown = nullptr;
    REQUIRE(database_->GetPort(index, &unknown) == S_OK);
    REQUIRE(unknown != nullptr);
    ITidesPort* port = nullptr;
    REQUIRE(unknown->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port)) == S_OK);
    unknown->Release();
    return port;
  }

private:
  ITidesDatabase* database_ = nullptr;
};

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

struct SunTimes {
  std::string twilightBegin, sunrise, sunset, twilightEnd;
};

SunTimes SunOf(ITidesPort* port) {
  double b = 0, r = 0, s = 0, e = 0;
  REQUIRE(port->get_BeginTwilight(&b) == S_OK);
  REQUIRE(port->get_SunRise(&r) == S_OK);
  REQUIRE(port->get_SunSet(&s) == S_OK);
  REQUIRE(port->get_EndTwilight(&e) == S_OK);
  return {TimeOfDay(b), TimeOfDay(r), TimeOfDay(s), TimeOfDay(e)};
}

// Sun times of one station on one date, each case with a fresh load of the library.
SunTimes SunTimesAt(std::int16_t latitude, std::int16_t longitude, std::int8_t zone, double date) {
  StationFolder folder({{"Sun", latitude, longitude, zone, {{0, 1000, 0}}}});
  DllUnderTest dll;
  ITidesPort* port = Stations(dll, folder).Port(0);
  REQUIRE(port->Calculate(1.0, date) == S_OK);
  REQUIRE(Points(port) == 25);
  double day = 0;
  port->get_PredictionDate(&day);
  double rise = 0;
  port->get_SunRise(&rise);
  CHECK(std::floor(rise) == day);  // the times are on the predicted day
  const SunTimes times = SunOf(port);
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
  return times;
}

}  // namespace

TEST_CASE("a port created directly answers E_ACCESSDENIED everywhere and fires nothing") {
  DllUnderTest dll;
  ITidesPort* port = nullptr;
  REQUIRE(dll.Create(CLSID_TidesPort, &port) == S_OK);
  EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(port));
  BSTR name = nullptr;
  double d = 0;
  long n = 0;
  CHECK(port->get_PortName(&name) == E_ACCESSDENIED);
  CHECK(port->GetPortPos(&d, &d) == E_ACCESSDENIED);
  CHECK(port->Calculate(1.0, 36526.0) == E_ACCESSDENIED);
  CHECK(sink.calls == 0);
  CHECK(port->get_NumPoints(&n) == E_ACCESSDENIED);
  CHECK(port->get_WavePoint(0, &d) == E_ACCESSDENIED);
  CHECK(port->get_PredictionDate(&d) == E_ACCESSDENIED);
  CHECK(port->get_MaxValueIndex(&n) == E_ACCESSDENIED);
  CHECK(port->get_MinValueIndex(&n) == E_ACCESSDENIED);
  CHECK(port->get_MaxValue(&d) == E_ACCESSDENIED);
  CHECK(port->get_MinValue(&d) == E_ACCESSDENIED);
  CHECK(port->get_Step(&d) == E_ACCESSDENIED);
  CHECK(port->get_SunRise(&d) == E_ACCESSDENIED);
  CHECK(port->get_SunSet(&d) == E_ACCESSDENIED);
  CHECK(port->get_BeginTwilight(&d) == E_ACCESSDENIED);
  CHECK(port->get_EndTwilight(&d) == E_ACCESSDENIED);
  CHECK(port->get_TimeZone(&n) == E_ACCESSDENIED);
  CHECK(port->get_PortName(nullptr) == E_ACCESSDENIED);  // the state first, then the pointer
  sink.Disconnect();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("state machine: without points, with points, and back after a failed Calculate") {
  StationFolder folder({kS2Station});
  DllUnderTest dll;
  ITidesPort* port = Stations(dll, folder).Port(0);
  EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(port));

  // Initialised without points: the name, the position and NumPoints 0 only.
  CHECK(Points(port) == 0);
  double d = 0;
  long n = 0;
  CHECK(port->get_WavePoint(0, &d) == E_ACCESSDENIED);
  CHECK(port->get_MaxValue(&d) == E_ACCESSDENIED);
  CHECK(port->get_Step(&d) == E_ACCESSDENIED);
  CHECK(port->get_TimeZone(&n) == E_ACCESSDENIED);
  CHECK(port->get_NumPoints(nullptr) == E_POINTER);
  CHECK(port->get_PortName(nullptr) == E_POINTER);
  CHECK(port->GetPortPos(&d, nullptr) == E_POINTER);

  // With points.
  CHECK(port->Calculate(1.0, Date(2000, 1, 1)) == S_OK);
  CHECK(sink.calls == 1);
  CHECK(sink.lastId == 1);
  CHECK(sink.lastArgumentCount == 0);
  CHECK(Points(port) == 25);
  using DoubleGetter = HRESULT (STDMETHODCALLTYPE ITidesPort::*)(double*);
  const DoubleGetter getters[] = {&ITidesPort::get_PredictionDate, &ITidesPort::get_MaxValue,
                                  &ITidesPort::get_MinValue,       &ITidesPort::get_Step,
                                  &ITidesPort::get_SunRise,        &ITidesPort::get_SunSet,
                                  &ITidesPort::get_BeginTwilight,  &ITidesPort::get_EndTwilight};
  for (DoubleGetter getter : getters) {
    CHECK((port->*getter)(nullptr) == E_POINTER);
  }
  CHECK(port->get_MaxValueIndex(nullptr) == E_POINTER);
  CHECK(port->get_MinValueIndex(nullptr) == E_POINTER);
  CHECK(port->get_TimeZone(nullptr) == E_POINTER);
  CHECK(port->get_WavePoint(0, nullptr) == E_POINTER);
  CHECK(port->get_Step(&d) == S_OK);
  CHECK(d == 1.0);

  // A failed Calculate empties the day and still fires.
  CHECK(port->Calculate(0.0, Date(2000, 1, 1)) == S_OK);
  CHECK(sink.calls == 2);
  CHECK(Points(port) == 0);
  CHECK(port->get_Step(&d) == E_ACCESSDENIED);
  CHECK(port->get_WavePoint(0, &d) == E_ACCESSDENIED);

  CHECK(port->Calculate(0.5, Date(2000, 1, 1)) == S_OK);
  CHECK(Points(port) == 49);
  CHECK(sink.calls == 3);
  sink.Disconnect();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("Calculate: point counts of the step and the steps that give no day") {
  StationFolder folder({kS2Station});
  DllUnderTest dll;
  ITidesPort* port = Stations(dll, folder).Port(0);
  EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(port));
  const double day = Date(2000, 1, 1);

  struct Case {
    double step;
    long points;
  };
  const Case cases[] = {{1.0, 25},  {0.5, 49},  {0.25, 97}, {24.0, 2},  {30.0, 2},  {48.0, 1},
                        {0.0, 0},   {-1.0, 0},  {-16.0, 0}, {-20.0, 1}, {1e-12, 0},
                        {std::numeric_limits<double>::quiet_NaN(), 0},
                        {std::numeric_limits<double>::infinity(), 1}};
  int fired = 0;
  for (const Case& c : cases) {
    INFO("step ", c.step);
    CHECK(port->Calculate(c.step, day) == S_OK);
    CHECK(sink.calls == ++fired);  // success and failure alike
    CHECK(Points(port) == c.points);
  }

  REQUIRE(port->Calculate(1.0, day) == S_OK);
  double v = 0;
  CHECK(port->get_WavePoint(24, &v) == S_OK);
  CHECK(port->get_WavePoint(25, &v) == E_INVALIDARG);
  CHECK(port->get_WavePoint(-1, &v) == E_INVALIDARG);

  // The same through late binding, as script clients read it.
  VARIANT index, result;
  index.vt = VT_I4;
  index.lVal = 3;
  VariantInit(&result);
  DISPPARAMS params = {&index, nullptr, 1, 0};
  CHECK(port->Invoke(6, IID_NULL, 0, DISPATCH_METHOD | DISPATCH_PROPERTYGET, &params, &result, nullptr, nullptr) ==
        S_OK);
  CHECK(result.vt == VT_R8);
  CHECK(result.dblVal == Point(port, 3));
  index.lVal = 25;
  EXCEPINFO exception = {};
  CHECK(port->Invoke(6, IID_NULL, 0, DISPATCH_PROPERTYGET, &params, &result, &exception, nullptr) ==
        DISP_E_EXCEPTION);
  CHECK(exception.scode == E_INVALIDARG);
  SysFreeString(exception.bstrSource);
  SysFreeString(exception.bstrDescription);
  SysFreeString(exception.bstrHelpFile);
  sink.Disconnect();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("the day: whole-day truncation, heights x 0.01 at local midnight + k x step") {
  StationFolder folder({kS2Station});
  DllUnderTest dll;
  ITidesPort* port = Stations(dll, folder).Port(0);

  REQUIRE(port->Calculate(1.0, 36526.75) == S_OK);
  double date = 0;
  CHECK(port->get_PredictionDate(&date) == S_OK);
  CHECK(date == 36526.0);  // 2000-01-01

  // 2 + cos(30k - 90 degrees), published units.
  for (long k = 0; k <= 24; ++k) {
    INFO("hour ", k);
    CHECK(Point(port, k) == doctest::Approx(2.0 + std::cos((30.0 * k - 90.0) * kPi / 180.0)).epsilon(1e-5));
  }
  // 24:00 of one day is 00:00 of the next.
  const double midnight = Point(port, 24);
  REQUIRE(port->Calculate(1.0, 36527.2) == S_OK);
  CHECK(Point(port, 0) == doctest::Approx(midnight).epsilon(1e-5));

  // First of tied extremes: maxima at 3 and 15, minima at 9 and 21.
  REQUIRE(port->Calculate(1.0, 36526.0) == S_OK);
  long index = -1;
  CHECK(port->get_MaxValueIndex(&index) == S_OK);
  CHECK(index == 3);
  CHECK(port->get_MinValueIndex(&index) == S_OK);
  CHECK(index == 9);
  double value = 0;
  CHECK(port->get_MaxValue(&value) == S_OK);
  CHECK(value == doctest::Approx(3.0).epsilon(1e-6));
  CHECK(value == Point(port, 3));
  CHECK(Point(port, 15) == Point(port, 3));
  CHECK(port->get_MinValue(&value) == S_OK);
  CHECK(value == doctest::Approx(1.0).epsilon(1e-6));

  // A negative date before 1899-12-30 truncates towards zero as well.
  REQUIRE(port->Calculate(1.0, -0.75) == S_OK);
  CHECK(port->get_PredictionDate(&date) == S_OK);
  CHECK(date == 0.0);
  CHECK(Points(port) == 25);

  // A date the platform cannot convert ends without points.
  REQUIRE(port->Calculate(1.0, 1.0e7) == S_OK);
  CHECK(Points(port) == 0);
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("a day of more than 32767 points is computed to its last point") {
  StationFolder folder({kS2Station});
  DllUnderTest dll;
  ITidesPort* port = Stations(dll, folder).Port(0);
  const double step = 0.0005;  // 48001 points
  REQUIRE(port->Calculate(step, 36526.0) == S_OK);
  REQUIRE(Points(port) == 48001);
  for (long k : {0L, 32767L, 32768L, 40000L, 48000L}) {
    const double hours = k * step;
    INFO("point ", k);
    CHECK(Point(port, k) == doctest::Approx(2.0 + std::cos((30.0 * hours - 90.0) * kPi / 180.0)).epsilon(1e-4));
  }
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("a constant curve: extremes at 0, heights x 0.01, zone read back sign-extended") {
  StationFolder folder({kConstantStation, kS2Station});
  DllUnderTest dll;
  ITidesPort* constant = nullptr;
  ITidesPort* s2 = nullptr;
  {
    Stations stations(dll, folder);
    constant = stations.Port(0);
    s2 = stations.Port(1);
  }
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
  double latitude = 0, longitude = 0;
  CHECK(constant->GetPortPos(&latitude, &longitude) == S_OK);
  CHECK(latitude == 600 * 0.016666666666666666);
  CHECK(longitude == doctest::Approx(10.0));

  // Ports share the one engine: calculating another station leaves this day as it was,
  // and recalculating it gives the same heights.
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

TEST_CASE("Calculated reaches every connected sink, once per Calculate") {
  StationFolder folder({kS2Station});
  DllUnderTest dll;
  ITidesPort* port = Stations(dll, folder).Port(0);
  EventSink a(DIID__ITidesPortEvents), b(DIID__ITidesPortEvents);
  REQUIRE(a.Connect(port));
  REQUIRE(b.Connect(port));
  long seen = -1;
  a.onCall = [&] { seen = Points(port); };  // the day is in place when the event comes
  REQUIRE(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(a.calls == 1);
  CHECK(b.calls == 1);
  CHECK(seen == 25);
  CHECK(a.lastIidNull);
  CHECK(a.lastLocale == 0x400);
  CHECK(a.lastFlags == DISPATCH_METHOD);
  b.Disconnect();
  REQUIRE(port->Calculate(-1.0, 36526.0) == S_OK);
  CHECK(a.calls == 2);
  CHECK(b.calls == 1);
  CHECK(seen == 0);
  a.Disconnect();
  port->Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("sun times at the equator, with a zone far from the longitude, and near the poles") {
  const double equinox = Date(2000, 3, 20);
  SunTimes equator = SunTimesAt(0, 0, 0, equinox);
  CHECK(equator.twilightBegin == "05:19");
  CHECK(equator.sunrise == "06:03");
  CHECK(equator.sunset == "18:10");
  CHECK(equator.twilightEnd == "18:55");

  // Zone +8 at longitude 0: sunrise falls at -1.93 h; every event is brought into the day
  // and the day keeps its curve.
  SunTimes farZone = SunTimesAt(0, 0, 8, equinox);
  CHECK(farZone.twilightBegin == "21:19");
  CHECK(farZone.sunrise == "22:03");
  CHECK(farZone.sunset == "10:10");
  CHECK(farZone.twilightEnd == "10:55");

  // Zone -1 (UTC+1): an hour later than universal time.
  SunTimes east = SunTimesAt(0, 0, -1, equinox);
  CHECK(east.sunrise == "07:03");

  // 80 N at midsummer: polar day; at midwinter: polar night.
  SunTimes summer = SunTimesAt(4800, 0, 0, Date(2000, 6, 21));
  CHECK(summer.twilightBegin == "00:00");
  CHECK(summer.sunrise == "00:00");
  CHECK(summer.sunset == "23:59");
  CHECK(summer.twilightEnd == "23:59");
  SunTimes winter = SunTimesAt(4800, 0, 0, Date(2000, 12, 21));
  CHECK(winter.twilightBegin == "00:00");
  CHECK(winter.sunrise == "00:00");
  CHECK(winter.sunset == "00:00");
  CHECK(winter.twilightEnd == "00:00");

  // 89 N on 10 September: the sun stays up, so it is a polar day whatever the month.
  SunTimes september = SunTimesAt(5340, 0, 0, Date(2000, 9, 10));
  CHECK(september.sunset == "23:59");
  CHECK(september.twilightEnd == "23:59");
  // 89 S on 10 September: the sun stays down.
  SunTimes south = SunTimesAt(-5340, 0, 0, Date(2000, 9, 10));
  CHECK(south.sunset == "00:00");

  // 60 N at midsummer: no -12 degree twilight; both take the sunset hour with minute 0.
  SunTimes white = SunTimesAt(3600, 0, 0, Date(2000, 6, 21));
  CHECK(white.sunrise == "02:35");
  CHECK(white.sunset == "21:27");
  CHECK(white.twilightBegin == "21:00");
  CHECK(white.twilightEnd == "21:00");
}
