// ITidesPortList at its boundary: SetPortList with every VARIANT type, by-reference forms,
// SAFEARRAYs of no, one and two dimensions, non-zero lower bounds, the wrong element size
// and type, empty arrays, null elements and objects that are not ports; Selected with a
// null out-pointer; late bound as script hosts pass a GetPorts result. The list keeps one
// reference per element it takes (and none of what it refuses), always answers S_OK, and
// shows and reports only ports.
#include "tests/wine/boundary/boundary_support.h"
#include "tests/wine/boundary/control_host.h"
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/common/station_folder.h"

#include "BR_Info.h"

#include <doctest/doctest.h>

#include <functional>
#include <string>
#include <vector>

using namespace br::test;
using namespace br::test::boundary;

namespace {

enum DispId : DISPID { kSetPortList = 1, kSelected = 2 };

struct Stations {
  StationFolder folder{{{"Charlie", 600, 600, 0, {{0, 1000, 0}}},
                        {"Alpha", 610, 610, 0, {{0, 1000, 0}}},
                        {"Bravo", 620, 620, 0, {{0, 1000, 0}}}}};
  ITidesDatabase* database = nullptr;
  std::vector<IUnknown*> ports;  // Charlie, Alpha, Bravo, one reference each

  explicit Stations(const DllUnderTest& dll) {
    REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
    Variant path = Variant::Bstr(folder.Path());
    REQUIRE(database->Initialize(path.get().bstrVal) == S_OK);
    for (long i = 0; i < 3; ++i) {
      IUnknown* port = nullptr;
      REQUIRE(database->GetPort(i, &port) == S_OK);
      ports.push_back(port);
    }
  }
  ~Stations() { Release(); }
  void Release() {
    for (IUnknown* p : ports) p->Release();
    ports.clear();
    if (database) database->Release();
    database = nullptr;
  }
  std::vector<ULONG> References() const {
    std::vector<ULONG> counts;
    for (IUnknown* p : ports) counts.push_back(RefCount(p));
    return counts;
  }
};

std::wstring NameOf(IUnknown* port) {
  if (!port) return L"<none>";
  ITidesPort* typed = nullptr;
  if (FAILED(port->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&typed)))) return L"<not a port>";
  BSTR name = nullptr;
  typed->get_PortName(&name);
  std::wstring text = name ? name : L"";
  SysFreeString(name);
  typed->Release();
  return text;
}

std::wstring SelectedName(ITidesPortList* list) {
  IUnknown* port = kUntouchedUnknown;
  REQUIRE(list->get_Selected(&port) == S_OK);
  REQUIRE(port != kUntouchedUnknown);
  const std::wstring name = NameOf(port);
  if (port) port->Release();
  return name;
}

// Element pointers that must never be used.
IUnknown** Poison() {
  static IUnknown* poison[5] = {kUntouchedUnknown, kUntouchedUnknown, kUntouchedUnknown, kUntouchedUnknown,
                                kUntouchedUnknown};
  return poison;
}

struct ListRow {
  const char* what;
  std::function<Variant(Stations&)> make;
  std::vector<ULONG> extraReferences;  // taken by the list, per station port
  const wchar_t* selected;             // the first name in name order, or "<none>"
  int events;                          // SelectChanged fired by the fill
};

std::vector<ListRow> Rows() {
  auto all = [](Stations& s) { return s.ports; };
  return {
      {"VT_EMPTY (an empty box)", [](Stations&) { return Variant::Empty(); }, {0, 0, 0}, L"<none>", 0},
      {"VT_NULL", [](Stations&) { return Variant::Null(); }, {0, 0, 0}, L"<none>", 0},
      {"VT_I4", [](Stations&) { return Variant::I4(3); }, {0, 0, 0}, L"<none>", 0},
      {"VT_BSTR", [](Stations&) { return Variant::Bstr(L"Alpha"); }, {0, 0, 0}, L"<none>", 0},
      {"null BSTR", [](Stations&) { return Variant::NullBstr(); }, {0, 0, 0}, L"<none>", 0},
      {"VT_UNKNOWN null", [](Stations&) { return Variant::Unknown(nullptr); }, {0, 0, 0}, L"<none>", 0},
      {"VT_UNKNOWN one port", [](Stations& s) { return Variant::Unknown(s.ports[2]); }, {0, 0, 1}, L"Bravo", 1},
      {"VT_UNKNOWN not a port", [](Stations& s) { return Variant::Unknown(s.database); }, {0, 0, 0}, L"<none>", 0},
      {"VT_DISPATCH one port",
       [](Stations& s) {
         IDispatch* d = nullptr;
         s.ports[0]->QueryInterface(IID_IDispatch, reinterpret_cast<void**>(&d));
         Variant v = Variant::Dispatch(d);
         d->Release();
         return v;
       },
       {0, 0, 0}, L"<none>", 0},
      {"VT_ARRAY|VT_UNKNOWN of three", [=](Stations& s) { return Variant::Array(VT_UNKNOWN, MakeUnknownArray(all(s))); },
       {1, 1, 1}, L"Alpha", 1},
      {"lower bound 5", [=](Stations& s) { return Variant::Array(VT_UNKNOWN, MakeUnknownArray(all(s), 5)); },
       {1, 1, 1}, L"Alpha", 1},
      {"lower bound -7", [=](Stations& s) { return Variant::Array(VT_UNKNOWN, MakeUnknownArray(all(s), -7)); },
       {1, 1, 1}, L"Alpha", 1},
      {"no elements", [](Stations&) { return Variant::Array(VT_UNKNOWN, MakeUnknownArray({})); }, {0, 0, 0},
       L"<none>", 0},
      {"null elements and a non-port among ports",
       [](Stations& s) {
         return Variant::Array(VT_UNKNOWN, MakeUnknownArray({nullptr, s.ports[0], s.database, nullptr, s.ports[1]}));
       },
       {1, 1, 0}, L"Alpha", 1},
      {"a null array", [](Stations&) { return Variant::Array(VT_UNKNOWN, nullptr); }, {0, 0, 0}, L"<none>", 0},
      {"no dimensions",
       [](Stations&) {
         Variant v;
         v.get().vt = VT_ARRAY | VT_UNKNOWN;  // static descriptor: the Variant must not free it
         v.get().parray = ZeroDimensionArray();
         return v;
       },
       {0, 0, 0}, L"<none>", 0},
      {"two dimensions, one of them empty",
       [](Stations&) { return Variant::Array(VT_UNKNOWN, MakeArray(VT_UNKNOWN, {{0, 0}, {5, 0}})); }, {0, 0, 0},
       L"<none>", 0},
      // Nothing to read however long the first dimension says it is: the list must read
      // nothing (the data here is poison).
      {"two dimensions, one empty, the other claiming five (empty one first)",
       [](Stations&) { return Variant::Array(VT_UNKNOWN, MakeEmptyTwoDimensionArray(Poison(), 5, true)); },
       {0, 0, 0}, L"<none>", 0},
      {"two dimensions, one empty, the other claiming five (empty one last)",
       [](Stations&) { return Variant::Array(VT_UNKNOWN, MakeEmptyTwoDimensionArray(Poison(), 5, false)); },
       {0, 0, 0}, L"<none>", 0},
      {"elements of 4 bytes (VT_I4)", [](Stations&) { return Variant::Array(VT_UNKNOWN, MakeLongArray({1, 2, 3})); },
       {0, 0, 0}, L"<none>", 0},
      {"VT_ARRAY|VT_DISPATCH of ports",
       [](Stations& s) {
         SAFEARRAY* array = MakeArray(VT_DISPATCH, {{3, 0}});
         for (LONG i = 0; i < 3; ++i) {
           IDispatch* d = nullptr;
           s.ports[static_cast<std::size_t>(i)]->QueryInterface(IID_IDispatch, reinterpret_cast<void**>(&d));
           SafeArrayPutElement(array, &i, d);
           d->Release();
         }
         return Variant::Array(VT_DISPATCH, array);
       },
       {0, 0, 0}, L"<none>", 0},
      {"VT_ARRAY|VT_VARIANT", [](Stations&) { return Variant::Array(VT_VARIANT, MakeArray(VT_VARIANT, {{3, 0}})); },
       {0, 0, 0}, L"<none>", 0},
      {"elements of another size, no element type", [](Stations&) { return Variant::Array(VT_UNKNOWN, MakeRawArray(2, 3)); },
       {0, 0, 0}, L"<none>", 0},
  };
}

}  // namespace

TEST_CASE("ITidesPortList SetPortList: every form of list, on a window, answers S_OK and takes only ports") {
  DllUnderTest dll;
  Stations s(dll);
  HostedControl hosted(dll, CLSID_TidesPortList);
  ITidesPortList* list = hosted.Query<ITidesPortList>();
  EventSink sink(DIID__ITidesPortListEvents);
  REQUIRE(sink.Connect(list));
  const std::vector<ULONG> base = s.References();

  for (const ListRow& row : Rows()) {
    INFO(std::string(row.what));
    {
      Variant value = row.make(s);
      std::vector<ULONG> expected = s.References();  // with the Variant's own references
      for (std::size_t i = 0; i < expected.size(); ++i) expected[i] += row.extraReferences[i];
      const int before = sink.calls;
      CHECK(list->SetPortList(value.get()) == S_OK);
      CHECK(SelectedName(list) == row.selected);
      CHECK(sink.calls - before == row.events);
      CHECK(s.References() == expected);
      if (value.vt() == (VT_ARRAY | VT_UNKNOWN) && value.get().parray == ZeroDimensionArray()) value.get().vt = VT_EMPTY;
    }
    CHECK(list->SetPortList(Variant::Empty().get()) == S_OK);
    CHECK(s.References() == base);
  }
  sink.Disconnect();
  list->Release();
  hosted.Close();
  CHECK(s.References() == base);
  s.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("ITidesPortList without a window: lists are kept, nothing is selected, and Selected checks its pointer") {
  DllUnderTest dll;
  Stations s(dll);
  ITidesPortList* list = nullptr;
  REQUIRE(dll.Create(CLSID_TidesPortList, &list) == S_OK);
  const std::vector<ULONG> base = s.References();
  CHECK(list->get_Selected(nullptr) == E_POINTER);
  {
    Variant three = Variant::Array(VT_UNKNOWN, MakeUnknownArray(s.ports));
    CHECK(list->SetPortList(three.get()) == S_OK);
  }
  CHECK(s.References() == std::vector<ULONG>{base[0] + 1, base[1] + 1, base[2] + 1});
  CHECK(SelectedName(list) == L"<none>");
  list->Release();  // the list's end lets every port go
  CHECK(s.References() == base);
  s.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("ITidesPortList late bound: a GetPorts result passed on as scripts pass it") {
  DllUnderTest dll;
  Stations s(dll);
  HostedControl hosted(dll, CLSID_TidesPortList);
  ITidesPortList* list = hosted.Query<ITidesPortList>();
  IDispatch* d = list;
  const std::vector<ULONG> base = s.References();
  {
    VARIANT ports;
    REQUIRE(s.database->GetPorts(-90, -180, 90, 180, &ports) == S_OK);
    LateCall call(d, kSetPortList);
    call.Arg(Variant::Array(VT_UNKNOWN, ports.parray));  // the call's Variant owns the array now
    CHECK(call.Run() == S_OK);
    CHECK(SelectedName(list) == L"Alpha");
  }
  {
    LateCall call(d, kSelected, DISPATCH_PROPERTYGET);
    REQUIRE(call.Run() == S_OK);
    CHECK(call.result.vt == VT_UNKNOWN);
    CHECK(NameOf(call.result.punkVal) == L"Alpha");
  }
  struct LateRow {
    const char* what;
    DISPID id;
    WORD flags;
    std::function<void(LateCall&)> build;
    HRESULT expected;
  };
  const LateRow rows[] = {
      {"SetPortList()", kSetPortList, DISPATCH_METHOD, [](LateCall&) {}, DISP_E_BADPARAMCOUNT},
      {"Selected put", kSelected, DISPATCH_PROPERTYPUT, [&](LateCall& c) { c.Arg(Variant::Unknown(s.ports[0])); },
       DISP_E_MEMBERNOTFOUND},
      {"Selected(1)", kSelected, DISPATCH_PROPERTYGET, [](LateCall& c) { c.Arg(Variant::I4(1)); },
       DISP_E_NOTACOLLECTION},
  };
  for (const LateRow& row : rows) {
    INFO(std::string(row.what));
    LateCall call(d, row.id, row.flags);
    row.build(call);
    const HRESULT result = LateResult(call.Run(), call.exception);
    CAPTURE(result);
    CHECK(result == row.expected);
    CHECK(SelectedName(list) == L"Alpha");
  }
  list->Release();
  hosted.Close();
  CHECK(s.References() == base);
  s.Release();
  CHECK(dll.CanUnloadNow() == S_OK);
}
