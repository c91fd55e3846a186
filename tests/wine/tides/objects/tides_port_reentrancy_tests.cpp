// Calculated sinks that call back into the port: it keeps itself alive while it fires.
#include "tests/wine/common/boundary_support.h"

#include <cmath>

using namespace br::test;
using namespace br::test::boundary;

namespace {

// The day a port holds is whole: its point count is that of its step, every point reads.
void CheckWholeDay(ITidesPort* port, long points) {
  double value = 0;
  CHECK(Points(port) == points);
  for (long k = 0; k < points; ++k) CHECK((port->get_WavePoint(k, &value) == S_OK && std::isfinite(value)));
}

}  // namespace

TEST_CASE("a sink that releases the last reference to the port inside Calculated") {
  OpenTides t({kHarbour});
  auto port = ComRef<ITidesPort>::Adopt(t.Port(0));
  EventSink sink(DIID__ITidesPortEvents);
  AdviseOnly(port.Get(), DIID__ITidesPortEvents, sink);
  REQUIRE(RefCount(port.Get()) == 1);
  CHECK(sink.References() == 1);  // the connection's
  // Only the port's own hold keeps it alive until Calculate has returned.
  long seen = -1;  // the day is in place when the event comes, with no arguments
  sink.onCall = [&] { seen = Points(port.Get()), port.Reset(); };
  CHECK(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(sink.calls == 1);
  CHECK(seen == 25);
  CHECK(sink.lastId == 1);
  CHECK(sink.lastArgumentCount == 0);
  CHECK_FALSE(port);
  CHECK(sink.References() == 0);  // the port's end released its connection
  CHECK(t.Finish() == S_OK);
}

TEST_CASE("sinks that disconnect themselves or others, release the database and calculate again inside Calculated") {
  OpenTides t({kHarbour});
  ITidesPort* port = t.Port(0);
  EventSink first(DIID__ITidesPortEvents), second(DIID__ITidesPortEvents), third(DIID__ITidesPortEvents);
  for (EventSink* s : {&first, &second, &third}) REQUIRE(s->Connect(port));
  first.onCall = [&] { first.Disconnect(); };
  second.onCall = [&] {  // before third's turn; the inner round fires second alone
    third.Disconnect();
    if (second.calls > 1) return;
    t.db.Reset();
    CHECK(port->Calculate(0.25, 36527.0) == S_OK);
  };
  CHECK(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(first.calls == 1);
  CHECK(second.calls == 2);
  CHECK(third.calls == 0);
  CHECK(first.References() == 0);
  CHECK(third.References() == 0);
  CheckWholeDay(port, 97);  // the inner day is the one kept
  double date = 0;
  CHECK(port->get_PredictionDate(&date) == S_OK);
  CHECK(date == 36527.0);
  second.Disconnect();
  port->Release();
  CHECK(t.Finish() == S_OK);
}
