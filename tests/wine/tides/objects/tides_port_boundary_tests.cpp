// ITidesPort with bad input: a failed getter writes nothing, changes nothing and fires nothing.
#include "tests/wine/common/boundary_support.h"

#include <cmath>

using namespace br::test;
using namespace br::test::boundary;

namespace {

constexpr double kDay = 36526.0, kFirstDate = -657434.0;  // 2000-01-01, 0100-01-01
constexpr double kPastLastDate = 2958466.0;                // the day after 9999-12-31

// The getters that need points (one of the two pointers set).
struct Getter {
  const char* name;
  HRESULT (STDMETHODCALLTYPE ITidesPort::*real)(double*);
  HRESULT (STDMETHODCALLTYPE ITidesPort::*whole)(long*);
};
using P = ITidesPort;
const Getter kPointGetters[] = {
    {"PredictionDate", &P::get_PredictionDate, nullptr}, {"MaxValueIndex", nullptr, &P::get_MaxValueIndex},
    {"MinValueIndex", nullptr, &P::get_MinValueIndex},   {"MaxValue", &P::get_MaxValue, nullptr},
    {"MinValue", &P::get_MinValue, nullptr},             {"Step", &P::get_Step, nullptr},
    {"SunRise", &P::get_SunRise, nullptr},               {"SunSet", &P::get_SunSet, nullptr},
    {"BeginTwilight", &P::get_BeginTwilight, nullptr},   {"EndTwilight", &P::get_EndTwilight, nullptr},
    {"TimeZone", nullptr, &P::get_TimeZone},
};
HRESULT Call(ITidesPort* p, const Getter& g, Outs* o) {
  return g.real ? (p->*g.real)(o ? &o->value : nullptr) : (p->*g.whole)(o ? &o->number : nullptr);
}

// The day a port shows: each getter's result and value, and the last point.
std::vector<std::pair<HRESULT, double>> Read(ITidesPort* port) {
  std::vector<std::pair<HRESULT, double>> f;
  Outs o;
  const HRESULT counted = port->get_NumPoints(&o.number);
  f.emplace_back(counted, o.number);
  const HRESULT last = port->get_WavePoint(o.number - 1, &o.value);
  f.emplace_back(last, o.value);
  for (const Getter& g : kPointGetters) {
    const HRESULT hr = Call(port, g, &o);  // before reading what it wrote
    f.emplace_back(hr, g.real ? o.value : o.number);
  }
  return f;
}

// A port's state and what each kind of call answers in it.
struct State {
  const char* name;
  ITidesPort* port;
  HRESULT plainNull;   // members that need no points, with a null out-pointer
  HRESULT pointsNull;  // members that need points, with a null out-pointer
  HRESULT pointsRead;  // members that need points, with a pointer (S_OK: not tried)
  HRESULT outside;     // WavePoint outside the day
  long points;
};

std::vector<Row> Rows(const State& s, Outs& o) {
  ITidesPort* p = s.port;
  std::vector<Row> rows = {
      {"PortName(null)", [=] { return p->get_PortName(nullptr); }, s.plainNull},
      {"GetPortPos(null, lon)", [=, &o] { return p->GetPortPos(nullptr, &o.second); }, s.plainNull},
      {"NumPoints(null)", [=] { return p->get_NumPoints(nullptr); }, s.plainNull},
      {"WavePoint(0, null)", [=] { return p->get_WavePoint(0, nullptr); }, s.pointsNull},
  };
  for (long k : {-1L, s.points, 65536L})
    rows.push_back({"WavePoint(" + std::to_string(k) + ")", [=, &o] { return p->get_WavePoint(k, &o.value); },
                    s.outside});
  for (const Getter& g : kPointGetters) {
    rows.push_back({std::string(g.name) + "(null)", [=] { return Call(p, g, nullptr); }, s.pointsNull});
    if (s.pointsRead != S_OK) rows.push_back({g.name, [=, &o] { return Call(p, g, &o); }, s.pointsRead});
  }
  if (s.plainNull == E_ACCESSDENIED) {  // a port with no station refuses everything
    rows.push_back({"PortName", [=, &o] { return p->get_PortName(&o.name); }, E_ACCESSDENIED});
    rows.push_back({"GetPortPos", [=, &o] { return p->GetPortPos(&o.value, &o.second); }, E_ACCESSDENIED});
    rows.push_back({"NumPoints", [=, &o] { return p->get_NumPoints(&o.number); }, E_ACCESSDENIED});
    rows.push_back({"Calculate(1, day)", [=] { return p->Calculate(1.0, kDay); }, E_ACCESSDENIED});
  }
  return rows;
}

}  // namespace

TEST_CASE("ITidesPort created directly, without points and with points: every member with bad pointers and indices") {
  OpenTides t({kHarbour});
  ITidesPort* direct = nullptr;
  REQUIRE(t.dll.Create(CLSID_TidesPort, &direct) == S_OK);
  ITidesPort* calculated = t.Port(0);
  REQUIRE(calculated->Calculate(1.0, kDay) == S_OK);
  REQUIRE(Points(calculated) == 25);
  const State states[] = {
      {"created directly", direct, E_ACCESSDENIED, E_ACCESSDENIED, E_ACCESSDENIED, E_ACCESSDENIED, 0},
      {"without points", t.Port(0), E_POINTER, E_ACCESSDENIED, E_ACCESSDENIED, E_ACCESSDENIED, 0},
      {"with points", calculated, E_POINTER, E_POINTER, S_OK, E_INVALIDARG, 25},
  };
  for (const State& s : states) {
    INFO(s.name);
    EventSink sink(DIID__ITidesPortEvents);
    REQUIRE(sink.Connect(s.port));
    Outs o;
    RunRows(Rows(s, o), [&] { return std::make_pair(Read(s.port), sink.calls); }, &o);
    sink.Disconnect();
    s.port->Release();
  }
  CHECK(t.Finish() == S_OK);
}

TEST_CASE("ITidesPort Calculate: NaN, infinite, tiny and huge steps and dates always end in S_OK and one event") {
  OpenTides t({kHarbour});
  ITidesPort* port = t.Port(0);
  EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(port));
  struct CalculateRow {
    const char* what;
    double step, date;
    long points;  // 0: no day, and the getters that need points refuse
  };
  const CalculateRow rows[] = {
      {"NaN step", kNaN, kDay, 0},
      {"infinite step", kInfinity, kDay, 1},
      // Finer than a point a second is refused.
      {"one point a second", 1.0 / 3600.0, kDay, 86401},
      {"a step finer than a second", 1.0 / 3601.0, kDay, 0},
      {"NaN date", 1.0, kNaN, 0},
      {"infinite date", 1.0, kInfinity, 0},
      {"first platform date", 1.0, kFirstDate, 25},
      {"day before the first platform date", 1.0, kFirstDate - 1.0, 0},
      {"last platform date, late in the day", 1.0, kPastLastDate - 0.25, 25},
      {"day after the last platform date", 1.0, kPastLastDate, 0},
      {"date before 1899-12-30 with a time", 1.0, -1.75, 25},
  };
  int fired = 0;
  Outs o;
  for (const CalculateRow& row : rows) {
    INFO(row.what);
    CHECK(port->Calculate(row.step, row.date) == S_OK);
    CHECK(sink.calls == ++fired);
    CHECK(Points(port) == row.points);
    o.Reset();
    if (row.points > 0) {
      const auto day = Read(port);  // count, last point, PredictionDate, ..., Step at 7
      for (const auto& answer : day) CHECK(answer.first == S_OK);
      CHECK(std::isfinite(day[1].second));
      CHECK(day[2].second == std::trunc(row.date));
      CHECK(day[7].second == row.step);
    } else {
      for (const Getter& g : kPointGetters) CHECK(Call(port, g, &o) == E_ACCESSDENIED);
      CHECK(o.Untouched());
    }
  }
  sink.Disconnect();
  port->Release();
  CHECK(t.Finish() == S_OK);
}
