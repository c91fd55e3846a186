// SelectChanged sinks that call back into TidesPortList, fired by a fill, by a key in the table
// and by an accessibility client picking a row.
#include "tests/wine/common/AccessibleReader.h"
#include "tests/wine/common/boundary_support.h"

#include <memory>

using namespace br::test;
using namespace br::test::boundary;

namespace {

struct List {
  OpenTides tides{ThreeStations()};
  std::vector<IUnknown*> ports = tides.Ports(3);
  HostedControl hosted{tides.dll, CLSID_TidesPortList};
  ComRef<ITidesPortList> list = hosted.Query<ITidesPortList>();

  HRESULT SetAll() { return list->SetPortList(Variant::Array(VT_UNKNOWN, MakeUnknownArray(ports)).get()); }
  // The table: the innermost window under the control's.
  HWND Table() const {
    HWND table = hosted.Window();
    while (HWND child = GetWindow(table, GW_CHILD)) table = child;
    return table;
  }
  void Key(UINT key) {
    HWND table = Table();
    SendMessageW(table, WM_KEYDOWN, key, 1);
    SendMessageW(table, WM_KEYUP, key, 0xC0000001);
  }
  HRESULT Finish() { return list.Reset(), hosted.Close(), tides.Finish(); }
};

}  // namespace

TEST_CASE("a SelectChanged sink that clears the list from inside the event fired by a fill") {
  List l;
  EventSink sink(DIID__ITidesPortListEvents);
  REQUIRE(sink.Connect(l.list.Get()));
  const std::vector<ULONG> base = RefCounts(l.ports);
  sink.onCall = [&] { CHECK(l.list->SetPortList(Variant::Empty().get()) == S_OK); };
  CHECK(l.SetAll() == S_OK);  // fills, selects the first name, fires, and is emptied inside
  CHECK(sink.calls == 1);
  CHECK(SelectedName(l.list.Get()).empty());
  CHECK(RefCounts(l.ports) == base);
  l.Key(VK_DOWN);  // no rows: nothing to select
  CHECK(sink.calls == 1);
  sink.Disconnect();
  CHECK(l.Finish() == S_OK);
}

TEST_CASE("a SelectChanged sink that disconnects itself, and one that closes the host, while the table selects") {
  List l;
  EventSink leaving(DIID__ITidesPortListEvents), closing(DIID__ITidesPortListEvents);
  REQUIRE(leaving.Connect(l.list.Get()));
  leaving.onCall = [&] { leaving.Disconnect(); };
  REQUIRE(l.SetAll() == S_OK);
  CHECK(leaving.calls == 1);
  l.Key(VK_DOWN);
  CHECK(leaving.calls == 1);

  REQUIRE(closing.Connect(l.list.Get()));
  const HWND controlWindow = l.hosted.Window();
  closing.onCall = [&] {
    closing.Disconnect();
    l.list.Reset();  // the test's references go; the host's goes with its window
    l.hosted.Close();
  };
  l.Key(VK_DOWN);  // the table is inside its own key handling when its window goes
  CHECK(closing.calls == 1);
  CHECK_FALSE(IsWindow(controlWindow));
  for (ULONG count : RefCounts(l.ports)) CHECK(count == 1);  // the list let every port go
  CHECK(l.Finish() == S_OK);
}

TEST_CASE("a SelectChanged sink that closes the host while an accessibility client picks a row") {
  List l;
  REQUIRE(l.SetAll() == S_OK);
  auto reader = std::make_unique<AccessibleReader>(l.Table());
  REQUIRE(reader->get() != nullptr);
  EventSink closing(DIID__ITidesPortListEvents);
  REQUIRE(closing.Connect(l.list.Get()));
  const HWND controlWindow = l.hosted.Window();
  closing.onCall = [&] {
    closing.Disconnect();
    l.list.Reset();
    l.hosted.Close();
  };
  CHECK(reader->get()->accSelect(SELFLAG_TAKESELECTION, ChildId(2)) == S_OK);
  CHECK(closing.calls == 1);
  CHECK_FALSE(IsWindow(controlWindow));
  LONG count = -1;
  CHECK(reader->get()->get_accChildCount(&count) == CO_E_OBJNOTCONNECTED);  // its table is gone
  CHECK(l.tides.dll.CanUnloadNow() == S_FALSE);  // the client's object still needs the code
  reader.reset();
  CHECK(l.Finish() == S_OK);
}
