// TidesPortList made from the built DLL in Wine's ATL host: the rows and their order,
// SelectChanged from filling, clicks and keys, Selected, the erase colour. VARIANT forms
// and re-entering sinks are in the boundary and re-entrancy suites.
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/controls/atl_host.h"
#include "tests/wine/controls/canvas.h"
#include "tests/wine/common/event_sink.h"
#include "tests/wine/controls/fake_tides_port.h"

#include "BR_Info.h"
#include "BR_Private.h"

#include <doctest/doctest.h>

#include <olectl.h>

#include <string>
#include <vector>

using namespace br::test;

namespace {

// Hands the list an array of the items (VT_ARRAY | VT_UNKNOWN), as a caller's array that
// it destroys afterwards.
HRESULT SetPorts(ITidesPortList* list, const std::vector<IUnknown*>& items) {
  SAFEARRAY* array = SafeArrayCreateVector(VT_UNKNOWN, 0, static_cast<ULONG>(items.size()));
  for (LONG i = 0; i < static_cast<LONG>(items.size()); ++i) SafeArrayPutElement(array, &i, items[i]);
  VARIANT v;
  VariantInit(&v);
  v.vt = VT_ARRAY | VT_UNKNOWN;
  v.parray = array;
  const HRESULT hr = list->SetPortList(v);
  SafeArrayDestroy(array);
  return hr;
}

HWND FindByClass(HWND parent, const char* name) {
  for (HWND child = GetWindow(parent, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
    char found[64] = {};
    GetClassNameA(child, found, sizeof found);
    if (std::string(found) == name) return child;
    if (HWND deeper = FindByClass(child, name)) return deeper;
  }
  return nullptr;
}

// The table's row height: its font's text height plus 6.
int RowHeight(HWND table) {
  HGDIOBJ font = reinterpret_cast<HGDIOBJ>(SendMessageA(table, WM_GETFONT, 0, 0));
  HDC dc = GetDC(nullptr);
  HGDIOBJ old = SelectObject(dc, font ? font : GetStockObject(DEFAULT_GUI_FONT));
  TEXTMETRICA metrics{};
  GetTextMetricsA(dc, &metrics);
  SelectObject(dc, old);
  ReleaseDC(nullptr, dc);
  return metrics.tmHeight + 6;
}

std::wstring SelectedName(ITidesPortList* list) {
  IUnknown* port = nullptr;
  REQUIRE(list->get_Selected(&port) == S_OK);
  const std::wstring name = PortName(port);
  if (port) port->Release();
  return name;
}

// A list made from the DLL; hosted in a window on demand.
struct PortList {
  DllUnderTest dll;
  AtlHost atl;
  ITidesPortList* list = nullptr;
  HWND host = nullptr;
  IUnknown* site = nullptr;
  HWND window = nullptr;
  HWND table = nullptr;
  EventSink sink{DIID__ITidesPortListEvents};
  std::vector<std::wstring>& names = sink.portNames;

  PortList() {
    REQUIRE(dll.Create(CLSID_TidesPortList, &list) == S_OK);
    sink.recordPortNames = true;
    REQUIRE(sink.Connect(list));
  }
  ~PortList() { Finish(); }

  void Host() {
    host = AtlHost::MakeWindow(300, 200);
    REQUIRE(atl.Attach(list, host, &site) == S_OK);
    IOleWindow* ole = Query<IOleWindow>(list);
    ole->GetWindow(&window);
    ole->Release();
    REQUIRE(window != nullptr);
    table = FindByClass(window, "Brine_AWTATL44");
    REQUIRE(table != nullptr);
    RECT tableRect{};
    GetClientRect(table, &tableRect);
    CHECK(tableRect.bottom > 150);  // laid out over the control
  }

  void Click(int displayRow) {
    const int h = RowHeight(table);
    const LPARAM at = MAKELPARAM(20, h * (displayRow + 1) + h / 2);
    SendMessageA(table, WM_LBUTTONDOWN, MK_LBUTTON, at);
    SendMessageA(table, WM_LBUTTONUP, 0, at);
  }

  HRESULT Finish() {
    if (!list) return dll.CanUnloadNow();
    sink.Disconnect();
    if (host) DestroyWindow(host);
    host = nullptr;
    ReleaseAndNull(site);
    ReleaseAndNull(list);
    return dll.CanUnloadNow();
  }
};

}  // namespace

TEST_CASE("three ports in a window: shown by name, the first selected and fired once") {
  FakeTidesPort havre(L"Le Havre"), anvers(L"Anvers"), brest(L"Brest");
  PortList p;
  p.Host();
  CHECK(SetPorts(p.list, {&havre, &anvers, &brest}) == S_OK);
  REQUIRE(p.names.size() == 1);
  CHECK(p.names[0] == L"Anvers");
  CHECK(p.sink.lastId == 1);
  CHECK(p.sink.lastArgumentCount == 1);
  CHECK(p.sink.argumentTypes[0] == VT_DISPATCH);
  CHECK(SelectedName(p.list) == L"Anvers");

  // Rows are mapped through their row data, whatever the order shown.
  p.Click(2);
  REQUIRE(p.names.size() == 2);
  CHECK(p.names[1] == L"Le Havre");
  CHECK(SelectedName(p.list) == L"Le Havre");
  p.Click(1);
  CHECK(p.names.back() == L"Brest");
  p.Click(1);  // the same row: no change, no event
  CHECK(p.names.size() == 3);
  // (Keys that move the selection: the navigation case below and the table's own suite.)

  // Replacing the list with nothing empties the table: nothing is selected.
  VARIANT empty;
  VariantInit(&empty);
  CHECK(p.list->SetPortList(empty) == S_OK);
  CHECK(SelectedName(p.list).empty());
  CHECK(p.names.size() == 3);
  CHECK(havre.References() == 0);
  CHECK(p.Finish() == S_OK);
}

// A single port as VT_UNKNOWN: the boundary suite's list forms.
TEST_CASE("entries that are no ports keep their index and are not shown") {
  FakeTidesPort havre(L"Le Havre"), brest(L"Brest");
  NotAPort stranger;
  PortList p;
  p.Host();
  CHECK(SetPorts(p.list, {&havre, &stranger, nullptr, &brest}) == S_OK);
  CHECK(stranger.References() == 1);  // kept, though not shown
  REQUIRE(p.names.size() == 1);
  CHECK(p.names[0] == L"Brest");
  p.Click(1);
  CHECK(p.names.back() == L"Le Havre");
  p.Click(2);  // only two rows
  CHECK(p.names.size() == 2);
  CHECK(p.Finish() == S_OK);
  CHECK(stranger.References() == 0);
}

TEST_CASE("ports set before the window fill the table when it is made") {
  FakeTidesPort havre(L"Le Havre"), anvers(L"Anvers");
  PortList p;
  SetPorts(p.list, {&havre, &anvers});
  CHECK(p.names.empty());
  p.Host();
  REQUIRE(p.names.size() == 1);
  CHECK(p.names[0] == L"Anvers");
  CHECK(SelectedName(p.list) == L"Anvers");
  CHECK(p.Finish() == S_OK);
  CHECK(havre.References() == 0);
}

TEST_CASE("navigation keys given to the accelerator translation reach the focused table") {
  FakeTidesPort havre(L"Le Havre"), anvers(L"Anvers"), brest(L"Brest");
  PortList p;
  p.Host();
  SetPorts(p.list, {&havre, &anvers, &brest});
  SetFocus(p.table);
  IOleInPlaceActiveObject* active = Query<IOleInPlaceActiveObject>(p.list);
  MSG down{p.table, WM_KEYDOWN, VK_DOWN, 1, 0, {0, 0}};
  CHECK(active->TranslateAccelerator(&down) == S_OK);
  CHECK(p.names.back() == L"Brest");
  MSG letter{p.table, WM_KEYDOWN, 'A', 1, 0, {0, 0}};
  CHECK(active->TranslateAccelerator(&letter) == S_FALSE);
  MSG up{p.table, WM_KEYUP, VK_DOWN, 1, 0, {0, 0}};
  CHECK(active->TranslateAccelerator(&up) == S_OK);
  active->Release();
  CHECK(p.Finish() == S_OK);
}

TEST_CASE("the background is palette colour 7; a font object keeps the table working") {
  PortList p;
  p.Host();
  IEmbeddedControl* embedded = Query<IEmbeddedControl>(p.list);
  SAFEARRAY* colours = SafeArrayCreateVector(VT_I4, 0, 20);
  for (LONG i = 0; i < 20; ++i) {
    LONG value = RGB(10 * i, 3, 5);
    SafeArrayPutElement(colours, &i, &value);
  }
  VARIANT palette;
  palette.vt = VT_ARRAY | VT_I4;
  palette.parray = colours;
  CHECK(embedded->SetPalette(palette) == S_OK);
  SafeArrayDestroy(colours);

  Canvas erased(300, 200);
  CHECK(SendMessageA(p.window, WM_ERASEBKGND, reinterpret_cast<WPARAM>(erased.Dc()), 0) != 0);
  CHECK(erased.Count(RGB(70, 3, 5), 0, 0, 300, 200) == 300 * 200);

  // A font through slot 3 keeps the table working.
  FONTDESC description{sizeof(FONTDESC), const_cast<LPOLESTR>(L"Tahoma"), {120000, 0}, FW_BOLD, ANSI_CHARSET,
                       FALSE, FALSE, FALSE};
  IFont* font = nullptr;
  REQUIRE(OleCreateFontIndirect(&description, IID_IFont, reinterpret_cast<void**>(&font)) == S_OK);
  CHECK(embedded->SetFont(0, font, 0) == S_OK);
  CHECK(SendMessageA(p.table, WM_GETFONT, 0, 0) != 0);
  embedded->Release();
  // The font object may go once the control has let go of its handle.
  p.Finish();
  font->Release();
  CHECK(p.dll.CanUnloadNow() == S_OK);
}
