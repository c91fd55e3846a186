// Calls back into TidesWindow from inside its own calls out: a port whose getters drop the
// window's reference to it while the window paints or reads the pointer, MouseAction sinks
// that take the port away, recalculate, disconnect or close the host, and Calculated sinks
// of the port that replace the window's port while the window calculates. Run with the
// heap's free checking on: an object used after its end fails visibly.
#include "tests/wine/boundary/control_host.h"
#include "tests/wine/boundary/foreign_port.h"
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/station_folder.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

using namespace br::test;

namespace {

constexpr int kWidth = 300, kHeight = 200;

struct Graph {
  DllUnderTest dll;
  HostedControl hosted{dll, CLSID_TidesWindow, kWidth, kHeight};
  ITidesWindow* window = hosted.Query<ITidesWindow>();

  void Paint() {
    Picture picture(kWidth, kHeight);
    CHECK(picture.Draw(window) == S_OK);
    RedrawWindow(hosted.Window(), nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW);
  }
  void Move(int x) { SendMessageW(hosted.Window(), WM_MOUSEMOVE, 0, MAKELPARAM(x, 60)); }
  HRESULT Finish() {
    if (window) window->Release();
    window = nullptr;
    hosted.Close();
    return dll.CanUnloadNow();
  }
};

// A port the window alone holds, whose first getter call (after `armed`) takes it away.
ForeignPort* PortTakenAwayInside(ITidesWindow* window, bool& armed) {
  ForeignPort* port = ForeignPort::Create();
  REQUIRE(window->SetPort(port) == S_OK);
  port->Release();  // the window's reference is the only one now
  port->onGet = [window, &armed] {
    if (!armed) return;
    armed = false;
    CHECK(window->SetPort(nullptr) == S_FALSE);
  };
  return port;
}

}  // namespace

TEST_CASE("a port that takes itself away from the window inside a getter, while the window paints") {
  Graph g;
  bool armed = false;
  PortTakenAwayInside(g.window, armed);
  armed = true;
  Picture picture(kWidth, kHeight);
  CHECK(picture.Draw(g.window) == S_OK);
  CHECK_FALSE(armed);
  CHECK(ForeignPort::Alive() == 0);  // gone once the paint let it go
  g.Paint();                          // and the window paints without it
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("a port that takes itself away from the window inside a getter, while the window reads the pointer") {
  Graph g;
  bool armed = false;
  PortTakenAwayInside(g.window, armed);
  g.Paint();
  EventSink sink(DIID__ITidesWindowEvents);
  REQUIRE(sink.Connect(g.window));
  armed = true;
  g.Move(150);
  CHECK_FALSE(armed);
  CHECK(ForeignPort::Alive() == 0);
  CHECK(sink.calls == 0);  // the day went away before a time was read: nothing to report
  g.Move(150);
  CHECK(sink.calls == 0);
  sink.Disconnect();
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("MouseAction sinks that take the port away, recalculate and disconnect from inside the event") {
  StationFolder folder({{"Harbour", 1200, 0, 0, {{0, 2000, 0}, {36, 1000, 900}}}});
  Graph g;
  ITidesDatabase* database = nullptr;
  REQUIRE(g.dll.Create(CLSID_TidesDatabase, &database) == S_OK);
  BSTR path = SysAllocString(folder.Path().c_str());
  REQUIRE(database->Initialize(path) == S_OK);
  SysFreeString(path);
  IUnknown* port = nullptr;
  REQUIRE(database->GetPort(0, &port) == S_OK);
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
  g.Move(150);
  CHECK(first.calls == 1);
  CHECK(second.calls == 1);  // the round goes on to the sinks still connected
  CHECK(second.lastDoubles.size() == 2);
  g.Move(150);               // no port now: nothing more
  CHECK(second.calls == 1);
  second.Disconnect();

  // The day the inner Calculate made stays with the port.
  ITidesPort* typed = nullptr;
  REQUIRE(port->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&typed)) == S_OK);
  long points = 0;
  CHECK(typed->get_NumPoints(&points) == S_OK);
  CHECK(points == 49);
  typed->Release();
  port->Release();
  database->Release();
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
  HWND controlWindow = g.hosted.Window();
  sink.onCall = [&] {
    sink.Disconnect();
    g.window->Release();  // the test's references go; the host's goes with its window
    g.window = nullptr;
    g.hosted.Close();
  };
  SendMessageW(controlWindow, WM_MOUSEMOVE, 0, MAKELPARAM(150, 60));
  CHECK(sink.calls == 1);
  CHECK_FALSE(IsWindow(controlWindow));
  CHECK(ForeignPort::Alive() == 0);
  CHECK(g.Finish() == S_OK);
}

TEST_CASE("a Calculated sink of the port that gives the window another port while the window calculates") {
  StationFolder folder({{"North", 1200, 0, 0, {{0, 2000, 0}, {36, 1000, 900}}}, {"South", -600, 0, 0, {{0, 1000, 0}}}});
  Graph g;
  ITidesDatabase* database = nullptr;
  REQUIRE(g.dll.Create(CLSID_TidesDatabase, &database) == S_OK);
  BSTR path = SysAllocString(folder.Path().c_str());
  REQUIRE(database->Initialize(path) == S_OK);
  SysFreeString(path);
  IUnknown *north = nullptr, *south = nullptr;
  REQUIRE(database->GetPort(0, &north) == S_OK);
  REQUIRE(database->GetPort(1, &south) == S_OK);
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
  database->Release();
  CHECK(g.Finish() == S_OK);
}
