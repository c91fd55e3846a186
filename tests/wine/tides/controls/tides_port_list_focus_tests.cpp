// Keyboard focus of TidesPortList in Wine's ATL host, as a program's user meets it: the
// control's own window hands the focus to its table (given by SetFocus, or by UI activation),
// keys from the message queue move the selection, Tab and Shift+Tab leave for the host's
// next and previous tab stops, and IOleInPlaceActiveObject::TranslateAccelerator sends the
// navigation keys to the table while the focus is inside the control, and to no one else.
#include "tests/wine/common/FakeTidesPort.h"
#include "tests/wine/common/PortListControl.h"

#include <doctest/doctest.h>

using namespace br::test;

namespace {

void Pump() {
  MSG message;
  while (PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE)) {
    TranslateMessage(&message);
    DispatchMessageW(&message);
  }
}

// A key pressed and let go on the keyboard (with Shift held down around it when asked),
// delivered through the message queue to the window with the focus.
void Press(WORD key, bool shift = false) {
  std::vector<INPUT> inputs;
  auto add = [&](WORD k, bool up) {
    INPUT input{};
    input.type = INPUT_KEYBOARD;
    input.ki.wVk = k;
    input.ki.dwFlags = up ? KEYEVENTF_KEYUP : 0;
    inputs.push_back(input);
  };
  if (shift) add(VK_SHIFT, false);
  add(key, false);
  add(key, true);
  if (shift) add(VK_SHIFT, true);
  REQUIRE(SendInput(static_cast<UINT>(inputs.size()), inputs.data(), sizeof(INPUT)) == inputs.size());
  Pump();
}

// A host window with a tab stop before the list and one after it, in window order.
struct Desk {
  DllUnderTest dll;
  FakeTidesPort dieppe{L"Dieppe"}, anvers{L"Anvers"}, etel{L"Etel"}, calais{L"Calais"}, brest{L"Brest"};
  PortListControl list{dll};
  HWND host = AtlHost::MakeWindow(400, 240);
  HWND before = Button(L"before");
  HWND after = nullptr;

  Desk() {
    SetForegroundWindow(host);
    list.Host(host);
    after = Button(L"after");
    REQUIRE(list.SetPorts({&dieppe, &anvers, &etel, &calais, &brest}) == S_OK);
    REQUIRE(list.Names() == std::vector<std::wstring>{L"Anvers"});
    SetFocus(before);
    Pump();
  }
  HWND Button(const wchar_t* text) const {
    return CreateWindowExW(0, L"BUTTON", text, WS_CHILD | WS_VISIBLE | WS_TABSTOP, 0, 0, 60, 20, host, nullptr,
                           GetModuleHandleW(nullptr), nullptr);
  }
  HRESULT Finish() {
    list.Close();
    return dll.CanUnloadNow();
  }
};

}  // namespace

TEST_CASE("the control's window hands the focus to the table: Down three times selects the next three ports") {
  Desk d;
  SetFocus(d.list.Window());
  CHECK(GetFocus() == d.list.Table());
  for (int i = 0; i < 3; ++i) Press(VK_DOWN);
  CHECK(d.list.Names() == std::vector<std::wstring>{L"Anvers", L"Brest", L"Calais", L"Dieppe"});
  CHECK(d.list.Selected() == L"Dieppe");
  Press(VK_UP);
  CHECK(d.list.Names().back() == L"Calais");
  CHECK(d.Finish() == S_OK);
}

TEST_CASE("UI activation by the container focuses the table, also when the control is UI-active already") {
  Desk d;
  auto object = Query<IOleObject>(d.list.Get());
  ComRef<IOleClientSite> site;
  REQUIRE(object->GetClientSite(site.Out()) == S_OK);
  RECT position{0, 0, 400, 240};
  CHECK(object->DoVerb(OLEIVERB_UIACTIVATE, nullptr, site.Get(), 0, d.host, &position) == S_OK);
  CHECK(GetFocus() == d.list.Table());
  Press(VK_DOWN);
  CHECK(d.list.Names().back() == L"Brest");
  SetFocus(d.after);
  CHECK(object->DoVerb(OLEIVERB_UIACTIVATE, nullptr, site.Get(), 0, d.host, &position) == S_OK);
  CHECK(GetFocus() == d.list.Table());
  object.Reset();
  site.Reset();
  CHECK(d.Finish() == S_OK);
}

TEST_CASE("Tab and Shift+Tab leave the list for the host's next and previous tab stops, and Tab comes back") {
  Desk d;
  SetFocus(d.list.Window());
  Press(VK_TAB);
  CHECK(GetFocus() == d.after);
  SetFocus(d.list.Table());
  Press(VK_TAB, true);
  CHECK(GetFocus() == d.before);
  // The host's own tabbing reaches the list's window, which hands the focus on.
  SetFocus(GetNextDlgTabItem(d.host, d.before, FALSE));
  CHECK(GetFocus() == d.list.Table());
  CHECK(d.list.Names() == std::vector<std::wstring>{L"Anvers"});  // no key moved the selection
  CHECK(d.Finish() == S_OK);
}

TEST_CASE("TranslateAccelerator sends navigation keys and Tab to the table while the focus is inside the control") {
  Desk d;
  auto active = Query<IOleInPlaceActiveObject>(d.list.Get());
  const auto translate = [&](UINT message, WPARAM key) {
    MSG m{GetFocus(), message, key, message == WM_KEYUP ? 0xC0000001 : 1, 0, {0, 0}};
    return active->TranslateAccelerator(&m);
  };
  // The focus on a window of the host: not the control's keys.
  CHECK(translate(WM_KEYDOWN, VK_DOWN) == S_FALSE);
  CHECK(d.list.Names().size() == 1);
  // The focus on the control's own window: handed to the table first.
  SetFocus(d.list.Window());
  CHECK(translate(WM_KEYDOWN, VK_DOWN) == S_OK);
  CHECK(translate(WM_KEYUP, VK_DOWN) == S_OK);
  CHECK(d.list.Names().back() == L"Brest");
  CHECK(translate(WM_KEYDOWN, VK_DOWN) == S_OK);
  CHECK(d.list.Names().back() == L"Calais");
  CHECK(translate(WM_KEYDOWN, 'A') == S_FALSE);  // typing is the table's own business
  CHECK(translate(WM_CHAR, VK_DOWN) == S_FALSE);
  CHECK(translate(WM_KEYDOWN, VK_TAB) == S_OK);
  CHECK(GetFocus() == d.after);
  CHECK(translate(WM_KEYDOWN, VK_UP) == S_FALSE);
  CHECK(d.list.Names().back() == L"Calais");
  active.Reset();
  CHECK(d.Finish() == S_OK);
}

