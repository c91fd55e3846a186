// ITidesPortList with bad input: S_OK always, one reference per port taken and none of the rest.
#include "tests/wine/common/boundary_support.h"

using namespace br::test;
using namespace br::test::boundary;

namespace {

struct ListRow {
  const char* what;
  std::function<Variant()> make;
  std::vector<ULONG> taken = {0, 0, 0};  // references the list takes, per station port
  const wchar_t* selected = L"";         // the first name in name order
  int events = 0;                        // SelectChanged fired by the fill
};

// p: Charlie, Alpha, Bravo.
std::vector<ListRow> Rows(const std::vector<IUnknown*>& p, IUnknown* database) {
  static IUnknown* poison[5] = {kUntouchedUnknown, kUntouchedUnknown, kUntouchedUnknown, kUntouchedUnknown,
                                kUntouchedUnknown};  // elements that must never be read
  return {
      {"VT_EMPTY (an empty box)", [] { return Variant::Empty(); }},
      {"VT_I4", [] { return Variant::I4(3); }},
      {"null BSTR", [] { return Variant::NullBstr(); }},
      {"VT_UNKNOWN one port", [=] { return Variant::Unknown(p[2]); }, {0, 0, 1}, L"Bravo", 1},
      {"VT_UNKNOWN not a port", [=] { return Variant::Unknown(database); }},
      {"VT_DISPATCH one port",
       [=] { return Variant::Make(VT_DISPATCH, [&](VARIANT& v) { p[0]->QueryInterface(IID_IDispatch, &v.byref); }); }},
      {"VT_ARRAY|VT_UNKNOWN of three", [=] { return Variant::Array(VT_UNKNOWN, MakeUnknownArray(p)); }, {1, 1, 1},
       L"Alpha", 1},
      {"lower bound 5", [=] { return Variant::Array(VT_UNKNOWN, MakeUnknownArray(p, 5)); }, {1, 1, 1}, L"Alpha", 1},
      {"no elements", [] { return Variant::Array(VT_UNKNOWN, MakeUnknownArray({})); }},
      {"null elements and a non-port among ports",
       [=] { return Variant::Array(VT_UNKNOWN, MakeUnknownArray({nullptr, p[0], database, nullptr, p[1]})); },
       {1, 1, 0}, L"Alpha", 1},
      {"a null array", [] { return Variant::Array(VT_UNKNOWN, nullptr); }},
      {"no dimensions", [] { return Variant::ZeroDimensions(VT_UNKNOWN); }},
      // Regression: nothing to read however long the other dimension says it is.
      {"two dimensions, the empty one first, the other claiming five",
       [] { return Variant::Array(VT_UNKNOWN, MakeEmptyTwoDimensionArray(poison, 5, true)); }},
      {"two dimensions, the empty one last, the other claiming five",
       [] { return Variant::Array(VT_UNKNOWN, MakeEmptyTwoDimensionArray(poison, 5, false)); }},
      {"elements of 4 bytes (VT_I4)", [] { return Variant::Array(VT_UNKNOWN, MakeLongArray({1, 2, 3})); }},
      {"VT_ARRAY|VT_DISPATCH of ports",
       [=] { return Variant::Array(VT_DISPATCH, MakeUnknownArray(p, 0, VT_DISPATCH)); }},
      {"VT_ARRAY|VT_VARIANT", [] { return Variant::Array(VT_VARIANT, MakeArray(VT_VARIANT, {{3, 0}})); }},
      {"elements of another size, no element type", [] { return Variant::Array(VT_UNKNOWN, MakeRawArray(2, 3)); }},
  };
}

}  // namespace

TEST_CASE("ITidesPortList SetPortList: every form of list, on a window, answers S_OK and takes only ports") {
  OpenTides t(ThreeStations());
  const std::vector<IUnknown*>& ports = t.Ports(3);
  HostedControl hosted(t.dll, CLSID_TidesPortList);
  auto list = hosted.Query<ITidesPortList>();
  EventSink sink(DIID__ITidesPortListEvents);
  REQUIRE(sink.Connect(list.Get()));
  const std::vector<ULONG> base = RefCounts(ports);
  CHECK(list->get_Selected(nullptr) == E_POINTER);
  for (const ListRow& row : Rows(ports, t.db.Get())) {
    INFO(row.what);
    {
      Variant value = row.make();
      std::vector<ULONG> expected = RefCounts(ports);  // with the Variant's own references
      for (std::size_t i = 0; i < expected.size(); ++i) expected[i] += row.taken[i];
      const int before = sink.calls;
      CHECK(list->SetPortList(value.get()) == S_OK);
      CHECK(SelectedName(list.Get()) == row.selected);
      CHECK(sink.calls - before == row.events);
      CHECK(RefCounts(ports) == expected);
    }
    CHECK(list->SetPortList(Variant::Empty().get()) == S_OK);
    CHECK(RefCounts(ports) == base);
  }
  sink.Disconnect();
  list.Reset();
  hosted.Close();
  CHECK(RefCounts(ports) == base);
  CHECK(t.Finish() == S_OK);
}
