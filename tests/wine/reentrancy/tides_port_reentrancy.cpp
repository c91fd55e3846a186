// Calculated sinks that call back into the port: it keeps itself alive while it fires.
#include "tests/wine/boundary/boundary_support.h"

#include <cmath>

using namespace br::test;
using namespace br::test::boundary;

namespace {

// The day a port holds is whole: its point count is that of its step, every point reads.
void CheckWholeDay(ITidesPort* port, double step, long points) {
  CHECK(Points(port) == points);
  double value = 0;
  CHECK(port->get_Step(&value) == S_OK);
  CHECK(value == step);
  for (long k = 0; k < points; ++k) {
    CHECK(port->get_WavePoint(k, &value) == S_OK);
    CHECK(std::isfinite(value));
  }
}

}  // namespace

TEST_CASE("a sink that releases the last reference to the port inside Calculated") {
  OpenTides t({kHarbour});
  ITidesPort* port = t.Port(0);
  EventSink sink(DIID__ITidesPortEvents);
  AdviseOnly(port, DIID__ITidesPortEvents, sink);
  REQUIRE(RefCount(port) == 1);
  CHECK(sink.References() == 1);  // the connection's
  // Only the port's own hold keeps it alive until Calculate has returned.
  sink.onCall = [&] { ReleaseAndNull(port); };
  CHECK(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(sink.calls == 1);
  CHECK(port == nullptr);
  CHECK(sink.References() == 0);  // the port's end released its connection
  CHECK(t.Finish() == S_OK);
}

TEST_CASE("sinks that disconnect themselves, disconnect others or connect new ones inside Calculated") {
  OpenTides t({kHarbour});
  ITidesPort* port = t.Port(0);
  EventSink first(DIID__ITidesPortEvents), second(DIID__ITidesPortEvents), third(DIID__ITidesPortEvents),
      late(DIID__ITidesPortEvents);
  for (EventSink* s : {&first, &second, &third}) REQUIRE(s->Connect(port));
  // first leaves; second takes third out before its turn and brings late in.
  first.onCall = [&] { first.Disconnect(); };
  second.onCall = [&] {
    third.Disconnect();
    if (!late.Cookie()) REQUIRE(late.Connect(port));
  };
  CHECK(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(first.calls == 1);
  CHECK(second.calls == 1);
  CHECK(third.calls == 0);  // disconnected during the round before its turn
  CHECK(late.calls == 0);   // connected during the round: waits for the next
  CHECK(first.References() == 0);
  CHECK(third.References() == 0);
  second.onCall = nullptr;
  CHECK(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(first.calls == 1);
  CHECK(second.calls == 2);
  CHECK(late.calls == 1);
  CheckWholeDay(port, 1.0, 25);
  second.Disconnect();
  late.Disconnect();
  port->Release();
  CHECK(t.Finish() == S_OK);
}

TEST_CASE("a sink that releases the database and the port and calculates again: the inner day is the one kept") {
  OpenTides t({kHarbour});
  ITidesPort* port = t.Port(0);
  ITidesPort* held = port;
  held->AddRef();  // the sink's own
  EventSink sink(DIID__ITidesPortEvents);
  AdviseOnly(port, DIID__ITidesPortEvents, sink);
  int depth = 0;
  double innerStep = 0.25;
  sink.onCall = [&] {
    if (depth++ > 0) return;
    ReleaseAndNull(t.db);
    ReleaseAndNull(port);
    CHECK(held->Calculate(innerStep, 36527.0) == S_OK);
  };
  CHECK(held->Calculate(1.0, 36526.0) == S_OK);
  CHECK(sink.calls == 2);
  CheckWholeDay(held, 0.25, 97);
  double date = 0;
  CHECK(held->get_PredictionDate(&date) == S_OK);
  CHECK(date == 36527.0);
  // An inner call that fails leaves the port without points, readably.
  depth = 1;
  sink.onCall = [&] { if (depth++ == 1) CHECK(held->Calculate(innerStep, 36526.0) == S_OK); };
  innerStep = 0.0;
  CHECK(held->Calculate(1.0, 36526.0) == S_OK);
  CHECK(Points(held) == 0);
  CHECK(held->get_WavePoint(0, &date) == E_ACCESSDENIED);
  held->Release();
  CHECK(sink.References() == 0);
  CHECK(t.Finish() == S_OK);
}
