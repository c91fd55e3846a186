// GDI objects and references of the controls: the process holds as many GDI objects after
// 1000 paints, 1000 font changes and 1000 palette replacements of each control as before,
// and TidesPortList holds exactly one reference per port it keeps, for as long as it keeps it.
#include "tests/wine/boundary/boundary_support.h"
#include "tests/wine/boundary/control_host.h"
#include "tests/wine/common/dll_under_test.h"
#include "tests/wine/common/station_folder.h"
#include "tests/wine/leaks/resource_counters.h"

#include "BR_Info.h"
#include "BR_Private.h"

#include <doctest/doctest.h>

#include <olectl.h>

#include <cstdio>
#include <functional>
#include <string>
#include <vector>

using namespace br::test;
using namespace br::test::boundary;
using br::test::leaks::GdiObjects;

namespace {

constexpr int kRounds = 1000;

struct World {
  StationFolder folder{{{"Charlie", 600, 600, 0, {{0, 1000, 0}, {29, 500, 100}}},
                        {"Alpha", 610, 610, 0, {{0, 1000, 0}, {36, 300, 900}}},
                        {"Bravo", 620, 620, 0, {{0, 1000, 0}}}}};
  DllUnderTest dll;
  ITidesDatabase* database = nullptr;
  World() {
    REQUIRE(dll.Create(CLSID_TidesDatabase, &database) == S_OK);
    Variant path = Variant::Bstr(folder.Path());
    REQUIRE(database->Initialize(path.get().bstrVal) == S_OK);
  }
  ~World() { Release(); }
  void Release() {
    if (database) database->Release();
    database = nullptr;
  }
  // Everything released: the library can go.
  HRESULT Finish() {
    Release();
    return dll.CanUnloadNow();
  }
  IUnknown* Port(long i) {
    IUnknown* port = nullptr;
    REQUIRE(database->GetPort(i, &port) == S_OK);
    return port;
  }
};

// Runs action `kRounds` times after one warm-up round (the first paint makes the stock
// and cached objects a process keeps) and reports the GDI objects before and after.
void CheckFlat(const char* what, const std::function<void(int)>& action) {
  INFO(std::string(what));
  action(0);
  const long before = GdiObjects();
  for (int i = 1; i <= kRounds; ++i) action(i);
  const long after = GdiObjects();
  std::printf("%s: %ld GDI objects before, %ld after %d rounds\n", what, before, after, kRounds);
  CHECK(before > 0);
  CHECK(after == before);
}

IFont* MakeFont(int i) {
  FONTDESC description = {sizeof(FONTDESC), const_cast<LPOLESTR>(i % 2 ? L"Arial" : L"Tahoma"),
                          {{static_cast<ULONG>(80000 + 1000 * (i % 40)), 0}}, static_cast<SHORT>(i % 3 ? FW_NORMAL : FW_BOLD),
                          ANSI_CHARSET, FALSE, FALSE, FALSE};
  IFont* font = nullptr;
  REQUIRE(OleCreateFontIndirect(&description, IID_IFont, reinterpret_cast<void**>(&font)) == S_OK);
  return font;
}

std::vector<LONG> Colours(int seed) {
  std::vector<LONG> colours;
  for (int i = 0; i < 20; ++i) colours.push_back(RGB((seed * 7 + i) & 0xFF, (seed + 3 * i) & 0xFF, i));
  return colours;
}

// The three kinds of work on one hosted control.
void CheckControl(World& w, const CLSID& clsid, const std::function<void(IUnknown*)>& prepare) {
  HostedControl hosted(w.dll, clsid);
  prepare(hosted.Control());
  IEmbeddedControl* embedded = hosted.Query<IEmbeddedControl>();
  const HWND window = hosted.Window();
  CheckFlat("paints", [&](int) {
    RedrawWindow(window, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW | RDW_ALLCHILDREN);
    Picture picture(300, 200);
    picture.Draw(hosted.Control());
  });
  CheckFlat("font changes", [&](int i) {
    IFont* font = MakeFont(i);
    embedded->SetFont(0, font, 0);
    font->Release();  // the control keeps no reference: a copy, or a borrowed handle
    HFONT handle = CreateFontW(10 + i % 9, 0, 0, 0, FW_NORMAL, 0, 0, 0, 0, 0, 0, 0, 0, L"Arial");
    SendMessageW(window, WM_SETFONT, reinterpret_cast<WPARAM>(handle), TRUE);
    UpdateWindow(window);
    SendMessageW(window, WM_SETFONT, 0, FALSE);  // before the handle goes
    DeleteObject(handle);
  });
  CheckFlat("palette replacements", [&](int i) {
    Variant palette = Variant::Array(VT_I4, MakeLongArray(Colours(i)));
    embedded->SetPalette(palette.get());
    UpdateWindow(window);
  });
  embedded->Release();
}

}  // namespace

TEST_CASE("TidesWindow: paints, font changes and palette replacements leave the GDI objects as they were") {
  World w;
  IUnknown* port = w.Port(0);
  CheckControl(w, CLSID_TidesWindow, [&](IUnknown* control) {
    ITidesWindow* window = nullptr;
    REQUIRE(control->QueryInterface(IID_ITidesWindow, reinterpret_cast<void**>(&window)) == S_OK);
    REQUIRE(window->SetPort(port) == S_OK);
    REQUIRE(window->Calculate(0.25, 36526.0) == S_OK);
    window->Release();
  });
  port->Release();
  CHECK(w.Finish() == S_OK);
}

TEST_CASE("TidesPortList: paints, font changes and palette replacements leave the GDI objects as they were") {
  World w;
  std::vector<IUnknown*> ports = {w.Port(0), w.Port(1), w.Port(2)};
  CheckControl(w, CLSID_TidesPortList, [&](IUnknown* control) {
    ITidesPortList* list = nullptr;
    REQUIRE(control->QueryInterface(IID_ITidesPortList, reinterpret_cast<void**>(&list)) == S_OK);
    Variant array = Variant::Array(VT_UNKNOWN, MakeUnknownArray(ports));
    REQUIRE(list->SetPortList(array.get()) == S_OK);
    list->Release();
  });
  for (IUnknown* p : ports) p->Release();
  CHECK(w.Finish() == S_OK);
}

TEST_CASE("TidesPortList holds one reference per port it keeps: through lists, the window's end and its own") {
  World w;
  std::vector<IUnknown*> ports = {w.Port(0), w.Port(1), w.Port(2)};
  auto counts = [&] {
    std::vector<ULONG> c;
    for (IUnknown* p : ports) c.push_back(RefCount(p));
    return c;
  };
  const std::vector<ULONG> base = counts();
  const std::vector<ULONG> held = {base[0] + 1, base[1] + 1, base[2] + 1};
  {
    HostedControl hosted(w.dll, CLSID_TidesPortList);
    ITidesPortList* list = hosted.Query<ITidesPortList>();
    for (int round = 0; round < 100; ++round) {
      Variant array = Variant::Array(VT_UNKNOWN, MakeUnknownArray(ports));
      REQUIRE(list->SetPortList(array.get()) == S_OK);
      array = Variant::Empty();  // the caller's array goes; the list's references stay
      REQUIRE(counts() == held);
      IUnknown* selected = nullptr;
      REQUIRE(list->get_Selected(&selected) == S_OK);
      REQUIRE(selected != nullptr);
      selected->Release();
      if (round % 2) REQUIRE(list->SetPortList(Variant::Empty().get()) == S_OK);
      else REQUIRE(list->SetPortList(Variant::Unknown(ports[1]).get()) == S_OK);
      REQUIRE(counts() == (round % 2 ? base : std::vector<ULONG>{base[0], base[1] + 1, base[2]}));
    }
    Variant array = Variant::Array(VT_UNKNOWN, MakeUnknownArray(ports));
    REQUIRE(list->SetPortList(array.get()) == S_OK);
    CHECK(counts() == std::vector<ULONG>{base[0] + 2, base[1] + 2, base[2] + 2});  // the Variant's and the list's
    array = Variant::Empty();
    hosted.Close();  // the window's end lets the ports go, before the control's
    CHECK(counts() == base);
    REQUIRE(list->SetPortList(Variant::Unknown(ports[2]).get()) == S_OK);
    CHECK(counts() == std::vector<ULONG>{base[0], base[1], base[2] + 1});
    list->Release();  // and the control's end does too
    CHECK(counts() == base);
  }
  for (IUnknown* p : ports) p->Release();
  CHECK(w.Finish() == S_OK);
}
