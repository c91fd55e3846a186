// Sinks of Calculated that call back into the port from inside the event: release it,
// calculate again, disconnect themselves or others, connect new sinks. The port keeps
// itself alive while it fires and reads consistently afterwards.
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/station_folder.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <cmath>

using namespace br::test;

namespace {

const TestStation kStation = {"Harbour", 1200, 0, 0, {{0, 2000, 0}, {36, 1000, 900}}};

class Fixture {
public:
  Fixture() : folder_({kStation}) {
    REQUIRE(dll_.Create(CLSID_TidesDatabase, &db_) == S_OK);
    BSTR path = SysAllocString(folder_.Path().c_str());
    REQUIRE(db_->Initialize(path) == S_OK);
    SysFreeString(path);
  }
  ~Fixture() {
    if (db_) db_->Release();
  }
  ITidesPort* NewPort() {
    IUnknown* unknown = nullptr;
    REQUIRE(db_->GetPort(0, &unknown) == S_OK);
    ITidesPort* port = nullptr;
    REQUIRE(unknown->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&port)) == S_OK);
    unknown->Release();
    return port;
  }
  void ReleaseDatabase() {
    db_->Release();
    db_ = nullptr;
  }
  const DllUnderTest& Dll() const { return dll_; }

private:
  StationFolder folder_;
  DllUnderTest dll_;
  ITidesDatabase* db_ = nullptr;
};

long Points(ITidesPort* port) {
  long n = -1;
  REQUIRE(port->get_NumPoints(&n) == S_OK);
  return n;
}

// Connects sink to the port's events without keeping the connection point (which would
// hold a reference to the port), so the test's reference can be the port's last.
void AdviseOnly(IUnknown* source, EventSink& sink) {
  IConnectionPointContainer* container = nullptr;
  REQUIRE(source->QueryInterface(IID_IConnectionPointContainer, reinterpret_cast<void**>(&container)) == S_OK);
  IConnectionPoint* point = nullptr;
  REQUIRE(container->FindConnectionPoint(DIID__ITidesPortEvents, &point) == S_OK);
  container->Release();
  DWORD cookie = 0;
  REQUIRE(point->Advise(static_cast<IDispatch*>(&sink), &cookie) == S_OK);
  point->Release();
}

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
  Fixture f;
  ITidesPort* port = f.NewPort();
  EventSink sink(DIID__ITidesPortEvents);
  AdviseOnly(port, sink);
  REQUIRE(RefCount(port) == 1);
  // Once the test's reference is gone inside the event, only the port's own hold keeps it
  // alive until Calculate has returned.
  ITidesPort* doomed = port;
  sink.onCall = [&] {
    doomed->Release();
    doomed = nullptr;
  };
  CHECK(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(sink.calls == 1);
  CHECK(doomed == nullptr);
  CHECK(sink.References() == 0);  // the port's end released its connection
  f.ReleaseDatabase();
  CHECK(f.Dll().CanUnloadNow() == S_OK);
}

TEST_CASE("a sink that calculates again inside Calculated: the inner day is the one kept") {
  Fixture f;
  ITidesPort* port = f.NewPort();
  EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(port));
  int depth = 0;
  sink.onCall = [&] {
    if (depth++ == 0) CHECK(port->Calculate(0.5, 36527.0) == S_OK);
  };
  CHECK(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(sink.calls == 2);
  CheckWholeDay(port, 0.5, 49);
  double date = 0;
  CHECK(port->get_PredictionDate(&date) == S_OK);
  CHECK(date == 36527.0);

  // The same with an inner call that fails: the port is left without points, readably.
  depth = 0;
  sink.onCall = [&] {
    if (depth++ == 0) CHECK(port->Calculate(0.0, 36526.0) == S_OK);
  };
  CHECK(port->Calculate(1.0, 36526.0) == S_OK);
  CHECK(Points(port) == 0);
  double value = 0;
  CHECK(port->get_WavePoint(0, &value) == E_ACCESSDENIED);
  sink.Disconnect();
  port->Release();
  f.ReleaseDatabase();
  CHECK(f.Dll().CanUnloadNow() == S_OK);
}

TEST_CASE("sinks that disconnect themselves, disconnect others or connect new ones inside Calculated") {
  Fixture f;
  ITidesPort* port = f.NewPort();
  EventSink first(DIID__ITidesPortEvents), second(DIID__ITidesPortEvents), third(DIID__ITidesPortEvents),
      late(DIID__ITidesPortEvents);
  REQUIRE(first.Connect(port));
  REQUIRE(second.Connect(port));
  REQUIRE(third.Connect(port));

  // first leaves; second takes third out before third's turn and brings late in.
  first.onCall = [&] { first.Disconnect(); };
  second.onCall = [&] {
    third.Disconnect();
    if (late.calls == 0 && !late.Cookie()) REQUIRE(late.Connect(port));
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
  f.ReleaseDatabase();
  CHECK(f.Dll().CanUnloadNow() == S_OK);
}

TEST_CASE("a sink that releases the database and the port and then calculates through its own reference") {
  Fixture f;
  ITidesPort* port = f.NewPort();
  ITidesPort* held = port;
  held->AddRef();  // the sink's own
  EventSink sink(DIID__ITidesPortEvents);
  AdviseOnly(port, sink);
  int depth = 0;
  sink.onCall = [&] {
    if (depth++ > 0) return;
    f.ReleaseDatabase();
    port->Release();
    port = nullptr;
    CHECK(held->Calculate(0.25, 36526.0) == S_OK);
  };
  CHECK(held->Calculate(1.0, 36526.0) == S_OK);
  CHECK(sink.calls == 2);
  CheckWholeDay(held, 0.25, 97);
  held->Release();
  CHECK(sink.References() == 0);
  CHECK(f.Dll().CanUnloadNow() == S_OK);
}
