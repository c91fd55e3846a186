// TidesPortList made from the built DLL in Wine's ATL host: rows by name mapped to the
// ports given, SelectChanged from filling, clicks and keys, Selected, the erase colour.
// VARIANT forms, fonts and re-entering sinks: the boundary, leak and re-entrancy suites.
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/EventSink.h"
#include "tests/wine/common/AtlHost.h"
#include "tests/wine/common/Canvas.h"
#include "tests/wine/common/FakeTidesPort.h"

#include "BR_Private.h"

#include <doctest/doctest.h>

#include <string>

using namespace br::test;

namespace {

HWND FindByClass(HWND parent, const char* name) {
  for (HWND child = GetWindow(parent, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
    char found[64] = {};
    GetClassNameA(child, found, sizeof found);
    if (std::string(found) == name) return child;
    if (HWND deeper = FindByClass(child, name)) return deeper;
  }
  return nullptr;
}

// A list made from the DLL, its SelectChanged ports recorded by name; hosted on demand.
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

  // Hands the list an array of the items (VT_ARRAY | VT_UNKNOWN) that it destroys afterwards.
  HRESULT SetPorts(const std::vector<IUnknown*>& items) {
    VARIANT v;
    v.vt = VT_ARRAY | VT_UNKNOWN;
    v.parray = SafeArrayCreateVector(VT_UNKNOWN, 0, static_cast<ULONG>(items.size()));
    for (LONG i = 0; i < static_cast<LONG>(items.size()); ++i) SafeArrayPutElement(v.parray, &i, items[i]);
    const HRESULT hr = list->SetPortList(v);
    SafeArrayDestroy(v.parray);
    return hr;
  }
  std::wstring Selected() {
    IUnknown* port = nullptr;
    REQUIRE(list->get_Selected(&port) == S_OK);
    const std::wstring name = PortName(port);
    if (port) port->Release();
    return name;
  }
  void Host() {
    host = AtlHost::MakeWindow(300, 200);
    REQUIRE(atl.Attach(list, host, &site) == S_OK);
    IOleWindow* ole = Query<IOleWindow>(list);
    ole->GetWindow(&window);
    ole->Release();
    REQUIRE((table = FindByClass(window, "Brine_AWTATL44")) != nullptr);
    RECT tableRect{};
    GetClientRect(table, &tableRect);
    CHECK(tableRect.bottom > 150);  // laid out over the control as the window is made
  }
  // Clicks the row shown at displayRow (rows: the font's text height plus 6, under a header).
  void Click(int displayRow) {
    HGDIOBJ font = reinterpret_cast<HGDIOBJ>(SendMessageA(table, WM_GETFONT, 0, 0));
    HDC dc = GetDC(nullptr);
    HGDIOBJ old = SelectObject(dc, font ? font : GetStockObject(DEFAULT_GUI_FONT));
    TEXTMETRICA metrics{};
    GetTextMetricsA(dc, &metrics);
    SelectObject(dc, old);
    ReleaseDC(nullptr, dc);
    const int h = metrics.tmHeight + 6;
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

// Filling at the window's making is a mended fault (the table is laid out with the window).
TEST_CASE("ports set before the window fill the table when it is made; rows by name, clicks and keys; colour 7") {
  FakeTidesPort havre(L"Le Havre"), anvers(L"Anvers"), brest(L"Brest");
  NotAPort stranger;
  PortList p;
  CHECK(p.SetPorts({&havre, &stranger, &anvers, &brest}) == S_OK);
  CHECK(stranger.References() == 1);  // kept at its index, not shown
  CHECK(p.names.empty());
  p.Host();
  REQUIRE(p.names.size() == 1);
  CHECK(p.names[0] == L"Anvers");
  CHECK(p.sink.lastId == 1);
  CHECK(p.sink.argumentTypes[0] == VT_DISPATCH);
  CHECK(p.Selected() == L"Anvers");
  p.Click(2);
  REQUIRE(p.names.size() == 2);
  CHECK(p.names[1] == L"Le Havre");
  CHECK(p.Selected() == L"Le Havre");
  p.Click(1);  // past the stranger's index
  CHECK(p.names.back() == L"Brest");
  p.Click(1);  // the same row: no change, no event
  p.Click(3);  // only three rows
  CHECK(p.names.size() == 3);
  VARIANT empty;
  VariantInit(&empty);
  CHECK(p.list->SetPortList(empty) == S_OK);  // nothing shown, nothing selected, no event
  CHECK(p.Selected().empty());
  CHECK(p.names.size() == 3);
  CHECK(havre.References() == 0);
  CHECK(stranger.References() == 0);

  // Ports set in the window: the first fired once; keys through accelerator translation.
  CHECK(p.SetPorts({&havre, &anvers, &brest}) == S_OK);
  REQUIRE(p.names.size() == 4);
  CHECK(p.names[3] == L"Anvers");
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

  // The background is palette colour 7.
  CHECK(SetRampPalette(p.list) == S_OK);
  Canvas erased(300, 200);
  CHECK(SendMessageA(p.window, WM_ERASEBKGND, reinterpret_cast<WPARAM>(erased.Dc()), 0) != 0);
  CHECK(erased.Count(RampColour(7), 0, 0, 300, 200) == 300 * 200);
  CHECK(p.Finish() == S_OK);
}
