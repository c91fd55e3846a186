// SelectChanged sinks that call back into TidesPortList, fired by a fill and by a key in the table.
#include "tests/wine/boundary/boundary_support.h"

using namespace br::test;
using namespace br::test::boundary;

namespace {

struct List {
  OpenTides tides{ThreeStations()};
  std::vector<IUnknown*> ports = tides.Ports(3);
  HostedControl hosted{tides.dll, CLSID_TidesPortList};
  ITidesPortList* list = hosted.Query<ITidesPortList>();

  HRESULT SetAll() { return list->SetPortList(Variant::Array(VT_UNKNOWN, MakeUnknownArray(ports)).get()); }
  // A key pressed in the table, the innermost window under the control's.
  void Key(UINT key) {
    HWND table = hosted.Window();
    while (HWND child = GetWindow(table, GW_CHILD)) table = child;
    SendMessageW(table, WM_KEYDOWN, key, 1);
    SendMessageW(table, WM_KEYUP, key, 0xC0000001);
  }
  HRESULT Finish() {
    ReleaseAndNull(list);
    hosted.Close();
    return tides.Finish();
  }
};

}  // namespace

TEST_CASE("SelectChanged sinks that clear the list from inside the event, fired by a fill and by a key") {
  List l;
  EventSink sink(DIID__ITidesPortListEvents);
  REQUIRE(sink.Connect(l.list));
  const std::vector<ULONG> base = RefCounts(l.ports);
  auto empty = [&] { CHECK(l.list->SetPortList(Variant::Empty().get()) == S_OK); };
  sink.onCall = empty;
  CHECK(l.SetAll() == S_OK);  // fills, selects the first name, fires, and is emptied inside
  CHECK(sink.calls == 1);
  CHECK(SelectedName(l.list) == L"<none>");
  CHECK(RefCounts(l.ports) == base);

  sink.onCall = nullptr;
  REQUIRE(l.SetAll() == S_OK);
  REQUIRE(sink.calls == 2);
  sink.onCall = empty;
  l.Key(VK_DOWN);  // the table moves its selection, fires, and loses every row inside
  CHECK(sink.calls == 3);
  l.Key(VK_DOWN);
  l.Key(VK_END);
  CHECK(sink.calls == 3);  // no rows: nothing to select
  CHECK(SelectedName(l.list) == L"<none>");
  CHECK(RefCounts(l.ports) == base);
  sink.Disconnect();
  CHECK(l.Finish() == S_OK);
}

TEST_CASE("SelectChanged sinks that replace the list and read Selected from inside the event") {
  List l;
  EventSink sink(DIID__ITidesPortListEvents);
  REQUIRE(sink.Connect(l.list));
  std::vector<std::wstring> seen;  // the row being selected is already current
  int depth = 0;
  sink.onCall = [&] {
    seen.push_back(SelectedName(l.list));
    if (depth++ == 0) {
      Variant two = Variant::Array(VT_UNKNOWN, MakeUnknownArray({l.ports[0], l.ports[2]}));
      CHECK(l.list->SetPortList(two.get()) == S_OK);  // fires again, for its own first name
    }
  };
  CHECK(l.SetAll() == S_OK);
  CHECK(seen == std::vector<std::wstring>{L"Alpha", L"Bravo"});
  CHECK(SelectedName(l.list) == L"Bravo");
  CHECK(RefCounts(l.ports) == std::vector<ULONG>{2, 1, 2});  // the test's, and the list's

  depth = 1;  // keys now: no more replacing
  l.Key(VK_DOWN);
  CHECK(seen.back() == L"Charlie");
  CHECK(SelectedName(l.list) == L"Charlie");
  sink.Disconnect();
  CHECK(l.Finish() == S_OK);
}

TEST_CASE("a SelectChanged sink that disconnects itself, and one that closes the host, while the table selects") {
  List l;
  EventSink leaving(DIID__ITidesPortListEvents), closing(DIID__ITidesPortListEvents);
  REQUIRE(leaving.Connect(l.list));
  leaving.onCall = [&] { leaving.Disconnect(); };
  REQUIRE(l.SetAll() == S_OK);
  CHECK(leaving.calls == 1);
  l.Key(VK_DOWN);
  CHECK(leaving.calls == 1);

  REQUIRE(closing.Connect(l.list));
  const HWND controlWindow = l.hosted.Window();
  closing.onCall = [&] {
    closing.Disconnect();
    ReleaseAndNull(l.list);  // the test's references go; the host's goes with its window
    l.hosted.Close();
  };
  l.Key(VK_DOWN);  // the table is inside its own key handling when its window goes
  CHECK(closing.calls == 1);
  CHECK_FALSE(IsWindow(controlWindow));
  for (ULONG count : RefCounts(l.ports)) CHECK(count == 1);  // the list let every port go
  CHECK(l.Finish() == S_OK);
}

TEST_CASE("a port of another make that empties the list from inside its name, while the list fills") {
  List l;
  EventSink sink(DIID__ITidesPortListEvents);
  REQUIRE(sink.Connect(l.list));
  ForeignPort* foreign = ForeignPort::Create();
  bool armed = true;
  foreign->onGet = [&] {
    if (!armed) return;
    armed = false;
    CHECK(l.list->SetPortList(Variant::Empty().get()) == S_OK);  // lets this very port go too
  };
  Variant list = Variant::Array(VT_UNKNOWN, MakeUnknownArray({l.ports[0], foreign, l.ports[1]}));
  foreign->Release();  // the array's and the list's references are the only ones
  CHECK(l.list->SetPortList(list.get()) == S_OK);
  list = Variant::Empty();
  CHECK_FALSE(armed);
  CHECK(ForeignPort::Alive() == 0);
  for (ULONG count : RefCounts(l.ports)) CHECK(count == 1);  // nothing kept
  CHECK(SelectedName(l.list) != L"Foreign");
  l.Key(VK_DOWN);
  l.Key(VK_HOME);
  sink.Disconnect();
  CHECK(l.Finish() == S_OK);
}
