// Ports and sinks that call back into TidesWindow from inside its own calls out.
#include "tests/wine/boundary/boundary_support.h"

using namespace br::test;
using namespace br::test::boundary;

namespace {

const TestStation kSouth = {"South", -600, 0, 0, {{0, 1000, 0}}};

struct Graph {
  OpenTides tides{{kHarbour, kSouth}};
  HostedControl hosted{tides.dll, CLSID_TidesWindow};
  ITidesWindow* window = hosted.Query<ITidesWindow>();

  void Paint() {
    Canvas canvas(300, 200);
    CHECK(DrawControl(window, canvas) == S_OK);
    hosted.Paint();
  }
  HRESULT Finish() {
    ReleaseAndNull(window);
    hosted.Close();
    return tides.Finish();
  }
};

// A port the window alone holds, whose first getter call once armed takes it away.
void PortTakenAwayInside(ITidesWindow* window, bool& armed) {
  ForeignPort* port = ForeignPort::Create();
  REQUIRE(window->SetPort(port) == S_OK);
  port->Release();
  port->onGet = [window, &armed] {
    if (!armed) return;
    armed = false;
    CHECK(window->SetPort(nullptr) == S_FALSE);
  };
}

}  // namespace

TEST_CASE("a port that takes itself away from the window inside a getter, while the window paints or reads") {
  Graph g;
  bool armed = false;
  PortTakenAwayInside(g.window, armed);
  armed = true;
  g.Paint();
  CHECK_FALSE(armed);
  CHECK(ForeignPort::Alive() == 0);  // gone once the paint let it go
  g.Paint();                          // and the window paints without it

  PortTakenAwayInside(g.window, armed);
  g.Paint();
  EventSink sink(DIID__ITidesWindowEvents);
  REQUIRE(sink.Connect(g.window));
  armed = true;
  g.hosted.MouseMove(150);
  CHECK_FALSE(armed);
  CHECK(ForeignPort::Alive() == 0);
  g.hosted.MouseMove(150);
  CHECK(sink.calls == 0);  // the day went away before a time was read: nothing to report
  sink.Disconnect();
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("MouseAction sinks that take the port away, recalculate and disconnect from inside the event") {
  Graph g;
  ITidesPort* port = g.tides.Port(0);
  REQUIRE(g.window->SetPort(port) == S_OK);
  REQUIRE(g.window->Calculate(1.0, 36526.0) == S_OK);
  g.Paint();
  EventSink first(DIID__ITidesWindowEvents), second(DIID__ITidesWindowEvents);
  REQUIRE(first.Connect(g.window));
  REQUIRE(second.Connect(g.window));
  first.onCall = [&] {
    CHECK(g.window->Calculate(0.5, 36527.0) == S_OK);  // repaints inside the event
    CHECK(g.window->SetPort(nullptr) == S_FALSE);
    first.Disconnect();
  };
  g.hosted.MouseMove(150);
  CHECK(first.calls == 1);
  CHECK(second.calls == 1);  // the round goes on to the sinks still connected
  CHECK(second.lastDoubles.size() == 2);
  g.hosted.MouseMove(150);  // no port now: nothing more
  CHECK(second.calls == 1);
  second.Disconnect();
  long points = 0;  // the day the inner Calculate made stays with the port
  CHECK(port->get_NumPoints(&points) == S_OK);
  CHECK(points == 49);
  port->Release();
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("a MouseAction sink that closes the host and lets the window go from inside the event") {
  Graph g;
  ForeignPort* port = ForeignPort::Create();
  REQUIRE(g.window->SetPort(port) == S_OK);
  port->Release();
  g.Paint();
  EventSink sink(DIID__ITidesWindowEvents);
  REQUIRE(sink.Connect(g.window));
  const HWND controlWindow = g.hosted.Window();
  sink.onCall = [&] {
    sink.Disconnect();
    ReleaseAndNull(g.window);  // the test's references go; the host's goes with its window
    g.hosted.Close();
  };
  SendMessageW(controlWindow, WM_MOUSEMOVE, 0, MAKELPARAM(150, 60));
  CHECK(sink.calls == 1);
  CHECK_FALSE(IsWindow(controlWindow));
  CHECK(ForeignPort::Alive() == 0);
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("a Calculated sink of the port that gives the window another port while the window calculates") {
  Graph g;
  IUnknown* north = g.tides.Unknown(0);
  IUnknown* south = g.tides.Unknown(1);
  REQUIRE(g.window->SetPort(north) == S_OK);
  north->Release();  // the window holds the only reference
  EventSink sink(DIID__ITidesPortEvents);
  REQUIRE(sink.Connect(north));
  sink.onCall = [&] {
    sink.Disconnect();
    CHECK(g.window->SetPort(south) == S_OK);  // north loses its last holder mid-Calculate
  };
  CHECK(g.window->Calculate(1.0, 36526.0) == S_OK);
  CHECK(sink.calls == 1);
  g.Paint();
  south->Release();
  CHECK(g.Finish() == S_OK);
}
