// Calls back into TidesPortList from inside SelectChanged, fired both by a fill (SetPortList
// on a live window) and by the keyboard in the table: clear or replace the list, read
// Selected, disconnect, and close the host and let the control go while the table is still
// inside its own selection. Run with the heap's free checking on.
#include "tests/wine/boundary/boundary_support.h"
#include "tests/wine/boundary/control_host.h"
#include "tests/wine/boundary/foreign_port.h"
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/station_folder.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <string>
#include <vector>

using namespace br::test;
using namespace br::test::boundary;

namespace {

struct List {
  StationFolder folder{{{"Charlie", 600, 600, 0, {{0, 1000, 0}}},
                        {"Alpha", 610, 610, 0, {{0, 1000, 0}}},
                        {"Bravo", 620, 620, 0, {{0, 1000, 0}}}}};
  DllUnderTest dll;
  ITidesDatabase* database = nullptr;
  std::vector<IUnknown*> ports;
  HostedControl hosted{dll, CLSID_TidesPortList};
  ITidesPortList* list = hosted.Query<ITidesPortList>();

  List() {
    REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
    Variant path = Variant::Bstr(folder.Path());
    REQUIRE(database->Initialize(path.get().bstrVal) == S_OK);
    for (long i = 0; i < 3; ++i) {
      IUnknown* port = nullptr;
      REQUIRE(database->GetPort(i, &port) == S_OK);
      ports.push_back(port);
    }
  }
  HRESULT SetAll() {
    Variant array = Variant::Array(VT_UNKNOWN, MakeUnknownArray(ports));
    return list->SetPortList(array.get());
  }
  // The innermost window under the control's: the table's.
  HWND TableWindow() const {
    HWND deepest = hosted.Window();
    while (HWND child = GetWindow(deepest, GW_CHILD)) deepest = child;
    return deepest;
  }
  void Key(UINT key) {
    const HWND table = TableWindow();
    SendMessageW(table, WM_KEYDOWN, key, 1);
    SendMessageW(table, WM_KEYUP, key, 0xC0000001);
  }
  std::vector<ULONG> References() const {
    std::vector<ULONG> counts;
    for (IUnknown* p : ports) counts.push_back(RefCount(p));
    return counts;
  }
  HRESULT Finish() {
    if (list) list->Release();
    list = nullptr;
    hosted.Close();
    for (IUnknown* p : ports) p->Release();
    database->Release();
    return dll.CanUnloadNow();
  }
};

std::wstring SelectedName(ITidesPortList* list) {
  IUnknown* port = nullptr;
  REQUIRE(list->get_Selected(&port) == S_OK);
  if (!port) return L"<none>";
  ITidesPort* typed = nullptr;
  port->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&typed));
  port->Release();
  BSTR name = nullptr;
  typed->get_PortName(&name);
  typed->Release();
  std::wstring text = name ? name : L"";
  SysFreeString(name);
  return text;
}

}  // namespace

TEST_CASE("SelectChanged sinks that clear the list from inside the event, fired by a fill and by a key") {
  List l;
  EventSink sink(DIID__ITidesPortListEvents);
  REQUIRE(sink.Connect(l.list));
  const std::vector<ULONG> base = l.References();
  sink.onCall = [&] { CHECK(l.list->SetPortList(Variant::Empty().get()) == S_OK); };
  CHECK(l.SetAll() == S_OK);  // fills, selects the first name, fires, and is emptied inside
  CHECK(sink.calls == 1);
  CHECK(SelectedName(l.list) == L"<none>");
  CHECK(l.References() == base);

  sink.onCall = nullptr;
  REQUIRE(l.SetAll() == S_OK);
  REQUIRE(sink.calls == 2);
  sink.onCall = [&] { CHECK(l.list->SetPortList(Variant::Empty().get()) == S_OK); };
  l.Key(VK_DOWN);  // the table moves its selection, fires, and loses every row inside
  CHECK(sink.calls == 3);
  l.Key(VK_DOWN);
  l.Key(VK_END);
  CHECK(sink.calls == 3);  // no rows: nothing to select
  CHECK(SelectedName(l.list) == L"<none>");
  CHECK(l.References() == base);
  sink.Disconnect();
  CHECK(l.Finish() == S_OK);
}

TEST_CASE("SelectChanged sinks that replace the list and read Selected from inside the event") {
  List l;
  EventSink sink(DIID__ITidesPortListEvents);
  REQUIRE(sink.Connect(l.list));
  std::vector<std::wstring> seen;
  int depth = 0;
  sink.onCall = [&] {
    seen.push_back(SelectedName(l.list));  // the row being selected is already current
    if (depth++ == 0) {
      Variant two = Variant::Array(VT_UNKNOWN, MakeUnknownArray({l.ports[0], l.ports[2]}));
      CHECK(l.list->SetPortList(two.get()) == S_OK);  // fires again, for its own first name
    }
  };
  CHECK(l.SetAll() == S_OK);
  CHECK(seen == std::vector<std::wstring>{L"Alpha", L"Bravo"});
  CHECK(SelectedName(l.list) == L"Bravo");
  const std::vector<ULONG> references = l.References();
  CHECK(references[0] == 2);  // the test's and the list's
  CHECK(references[1] == 1);
  CHECK(references[2] == 2);

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
    l.list->Release();  // the test's references go; the host's goes with its window
    l.list = nullptr;
    l.hosted.Close();
  };
  l.Key(VK_DOWN);  // the table is inside its own key handling when its window goes
  CHECK(closing.calls == 1);
  CHECK_FALSE(IsWindow(controlWindow));
  for (ULONG count : l.References()) CHECK(count == 1);  // the list let every port go
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
  {
    Variant list = Variant::Array(VT_UNKNOWN, MakeUnknownArray({l.ports[0], foreign, l.ports[1]}));
    foreign->Release();  // the array's and the list's references are the only ones
    CHECK(l.list->SetPortList(list.get()) == S_OK);
  }
  CHECK_FALSE(armed);
  CHECK(ForeignPort::Alive() == 0);
  for (ULONG count : l.References()) CHECK(count == 1);  // nothing kept
  CHECK(SelectedName(l.list) != L"Foreign");
  l.Key(VK_DOWN);
  l.Key(VK_HOME);
  sink.Disconnect();
  CHECK(l.Finish() == S_OK);
}
