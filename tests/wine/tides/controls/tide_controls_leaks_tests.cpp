// GDI objects of the controls over 1000 rounds of each kind of work. (TidesPortList's port
// references: boundary_tides_port_list counts them after every kind of list and the window's end.)
#include "tests/wine/common/boundary_support.h"

#include "BR_Private.h"

#include <olectl.h>
#include <winternl.h>

#include <cstdint>
#include <cstdio>

using namespace br::test;
using namespace br::test::boundary;

namespace {

// GDI objects of the process: GetGuiResources, or where Wine leaves that unimplemented, the
// live entries of the GDI handle table the PEB points to (16384 GDI_HANDLE_ENTRY of 24 bytes
// as Wine lays them out, the type byte at offset 14 zero in a free one).
long GdiObjects() {
  SetLastError(0);
  const DWORD counted = GetGuiResources(GetCurrentProcess(), GR_GDIOBJECTS);
  if (counted != 0 || GetLastError() != ERROR_CALL_NOT_IMPLEMENTED) return static_cast<long>(counted);
  PROCESS_BASIC_INFORMATION basic = {};
  if (NtQueryInformationProcess(GetCurrentProcess(), ProcessBasicInformation, &basic, sizeof basic, nullptr) != 0 ||
      !basic.PebBaseAddress)
    return -1;
  const auto* peb = reinterpret_cast<const std::uint8_t*>(basic.PebBaseAddress);
  const auto* table = *reinterpret_cast<const std::uint8_t* const*>(peb + (sizeof(void*) == 8 ? 0xF8 : 0x94));
  if (!table) return -1;
  long live = 0;
  for (std::size_t i = 0; i < 16384; ++i) live += table[24 * i + 14] != 0;
  return live;
}

// Runs action 1000 times after one warm-up round (the first paint makes the stock and
// cached objects a process keeps) and compares the GDI objects before and after.
void CheckFlat(const char* what, const std::function<void(int)>& action) {
  INFO(what);
  action(0);
  const long before = GdiObjects();
  for (int i = 1; i <= 1000; ++i) action(i);
  const long after = GdiObjects();
  std::printf("%s: %ld GDI objects before, %ld after 1000 rounds\n", what, before, after);
  CHECK(before > 0);
  CHECK(after == before);
}

// Paints, font changes and palette replacements of one hosted control.
void CheckControl(const DllUnderTest& dll, const CLSID& clsid, const std::function<void(IUnknown*)>& prepare) {
  HostedControl hosted(dll, clsid);
  prepare(hosted.Control());
  auto embedded = hosted.Query<IEmbeddedControl>();
  const HWND window = hosted.Window();
  CheckFlat("paints", [&](int) {
    RedrawWindow(window, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW | RDW_ALLCHILDREN);
    Canvas canvas(300, 200);
    DrawControl(hosted.Control(), canvas);
  });
  CheckFlat("font changes", [&](int i) {
    FONTDESC description = {sizeof(FONTDESC), const_cast<LPOLESTR>(i % 2 ? L"Arial" : L"Tahoma"),
                            {{static_cast<ULONG>(80000 + 1000 * (i % 40)), 0}},
                            static_cast<SHORT>(i % 3 ? FW_NORMAL : FW_BOLD), ANSI_CHARSET, FALSE, FALSE, FALSE};
    IFont* font = nullptr;
    REQUIRE(OleCreateFontIndirect(&description, IID_IFont, reinterpret_cast<void**>(&font)) == S_OK);
    embedded->SetFont(0, font, 0);
    font->Release();  // the control keeps no reference: a copy, or a borrowed handle
    HFONT handle = CreateFontW(10 + i % 9, 0, 0, 0, FW_NORMAL, 0, 0, 0, 0, 0, 0, 0, 0, L"Arial");
    SendMessageW(window, WM_SETFONT, reinterpret_cast<WPARAM>(handle), TRUE);
    UpdateWindow(window);
    SendMessageW(window, WM_SETFONT, 0, FALSE);  // before the handle goes
    DeleteObject(handle);
  });
  CheckFlat("palette replacements", [&](int i) {
    std::vector<LONG> colours;
    for (int k = 0; k < 20; ++k) colours.push_back(RGB((i * 7 + k) & 0xFF, (i + 3 * k) & 0xFF, k));
    embedded->SetPalette(Variant::Array(VT_I4, MakeLongArray(colours)).get());
    UpdateWindow(window);
  });
  embedded.Reset();
}

}  // namespace

TEST_CASE("TidesWindow and TidesPortList: paints, font changes and palette replacements leave the GDI objects") {
  OpenTides t(ThreeStations());
  const std::vector<IUnknown*>& ports = t.Ports(3);
  SUBCASE("TidesWindow") {
    CheckControl(t.dll, CLSID_TidesWindow, [&](IUnknown* control) {
      auto window = Query<ITidesWindow>(control);
      REQUIRE(window->SetPort(ports[0]) == S_OK);
      REQUIRE(window->Calculate(0.25, 36526.0) == S_OK);
      window.Reset();
    });
  }
  SUBCASE("TidesPortList") {
    CheckControl(t.dll, CLSID_TidesPortList, [&](IUnknown* control) {
      auto list = Query<ITidesPortList>(control);
      REQUIRE(list->SetPortList(Variant::Array(VT_UNKNOWN, MakeUnknownArray(ports)).get()) == S_OK);
      list.Reset();
    });
  }
  CHECK(t.Finish() == S_OK);
}
