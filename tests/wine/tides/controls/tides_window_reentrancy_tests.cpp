// Ports and sinks that call back into TidesWindow from inside its own calls out.
#include "tests/wine/common/boundary_support.h"

using namespace br::test;
using namespace br::test::boundary;

namespace {

struct Graph {
  OpenTides tides{{kHarbour}};
  HostedControl hosted{tides.dll, CLSID_TidesWindow};
  ComRef<ITidesWindow> window = hosted.Query<ITidesWindow>();

  void Paint() {
    Canvas canvas(300, 200);
    CHECK(DrawControl(window.Get(), canvas) == S_OK);
    hosted.Paint();
  }
  HRESULT Finish() { return window.Reset(), hosted.Close(), tides.Finish(); }
};

}  // namespace

TEST_CASE("MouseAction sinks that take the port away, recalculate and disconnect from inside the event") {
  Graph g;
  ITidesPort* port = g.tides.Port(0);
  REQUIRE(g.window->SetPort(port) == S_OK);
  REQUIRE(g.window->Calculate(1.0, 36526.0) == S_OK);
  g.Paint();
  EventSink first(DIID__ITidesWindowEvents), second(DIID__ITidesWindowEvents);
  REQUIRE(first.Connect(g.window.Get()));
  REQUIRE(second.Connect(g.window.Get()));
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
