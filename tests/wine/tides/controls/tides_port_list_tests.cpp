// TidesPortList made from the built DLL in Wine's ATL host: rows by name mapped to the
// ports given, SelectChanged from filling and clicks, Selected, the erase colour, and its
// picture from outside with the table in it. Keys and focus: the focus suite; VARIANT
// forms, fonts and re-entering sinks: the boundary, leak and re-entrancy suites.
#include "tests/wine/common/Canvas.h"
#include "tests/wine/common/FakeTidesPort.h"
#include "tests/wine/common/PortListControl.h"

#include "BR_Private.h"

#include <doctest/doctest.h>

using namespace br::test;

namespace {

// Clicks the row shown at displayRow (rows: the font's text height plus 6, under a header).
void Click(HWND table, int displayRow) {
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

}  // namespace

// Filling at the window's making is a mended fault (the table is laid out with the window).
TEST_CASE("ports set before the window fill the table when it is made; rows by name and clicks; colour 7") {
  DllUnderTest dll;
  FakeTidesPort havre(L"Le Havre"), anvers(L"Anvers"), brest(L"Brest");
  NotAPort stranger;
  PortListControl p(dll);
  CHECK(p.SetPorts({&havre, &stranger, &anvers, &brest}) == S_OK);
  CHECK(stranger.References() == 1);  // kept at its index, not shown
  CHECK(p.Names().empty());
  p.Host(AtlHost::MakeWindow(300, 200));
  REQUIRE(p.Names().size() == 1);
  CHECK(p.Names()[0] == L"Anvers");
  CHECK(p.sink.lastId == 1);
  CHECK(p.sink.argumentTypes[0] == VT_DISPATCH);
  CHECK(p.Selected() == L"Anvers");
  Click(p.Table(), 2);
  REQUIRE(p.Names().size() == 2);
  CHECK(p.Names()[1] == L"Le Havre");
  CHECK(p.Selected() == L"Le Havre");
  Click(p.Table(), 1);  // past the stranger's index
  CHECK(p.Names().back() == L"Brest");
  Click(p.Table(), 1);  // the same row: no change, no event
  Click(p.Table(), 3);  // only three rows
  CHECK(p.Names().size() == 3);
  VARIANT empty;
  VariantInit(&empty);
  CHECK(p->SetPortList(empty) == S_OK);  // nothing shown, nothing selected, no event
  CHECK(p.Selected().empty());
  CHECK(p.Names().size() == 3);
  CHECK(havre.References() == 0);
  CHECK(stranger.References() == 0);

  // Ports set in the window: the first fired once.
  CHECK(p.SetPorts({&havre, &anvers, &brest}) == S_OK);
  REQUIRE(p.Names().size() == 4);
  CHECK(p.Names()[3] == L"Anvers");

  // The background is palette colour 7.
  CHECK(SetRampPalette(p.Get()) == S_OK);
  Canvas erased(300, 200);
  CHECK(SendMessageA(p.Window(), WM_ERASEBKGND, reinterpret_cast<WPARAM>(erased.Dc()), 0) != 0);
  CHECK(erased.Count(RampColour(7), 0, 0, 300, 200) == 300 * 200);
  p.Close();
  CHECK(dll.CanUnloadNow() == S_OK);
}

// Wine's WM_PRINT draws no child windows: the control composes its table itself.
TEST_CASE("Draw, WM_PRINTCLIENT and PrintWindow picture the table with its rows and the selected one") {
  DllUnderTest dll;
  FakeTidesPort havre(L"Le Havre"), anvers(L"Anvers"), brest(L"Brest");
  PortListControl p(dll);
  p.Host(AtlHost::MakeWindow(300, 200));
  CHECK(p.SetPorts({&havre, &anvers, &brest}) == S_OK);
  RECT table{};
  GetWindowRect(p.Table(), &table);
  MapWindowPoints(HWND_DESKTOP, p.Window(), reinterpret_cast<POINT*>(&table), 2);
  const int rowHeight = (table.bottom - table.top) / 8;  // bounds for the band search below

  Canvas drawn(300, 200);
  REQUIRE(DrawControl(p.Get(), drawn) == S_OK);
  // The selected row (the first shown) is a band of the highlight colour with its name in
  // the highlight text colour; the other rows are text on the window colour.
  const COLORREF highlight = GetSysColor(COLOR_HIGHLIGHT);
  int bandTop = -1, bandBottom = -1;
  for (int y = table.top; y < table.bottom; ++y) {
    if (drawn.At(table.left + 100, y) != highlight) continue;
    if (bandTop < 0) bandTop = y;
    bandBottom = y + 1;
  }
  REQUIRE(bandTop > table.top);  // under the header
  CHECK(bandTop < table.top + 2 * rowHeight);
  CHECK(drawn.Count(GetSysColor(COLOR_HIGHLIGHTTEXT), table.left, bandTop, table.right, bandBottom) > 10);
  CHECK(drawn.Count(GetSysColor(COLOR_WINDOWTEXT), table.left, bandBottom, table.right, table.bottom) > 20);
  CHECK(drawn.Count(GetSysColor(COLOR_WINDOW), table.left, bandBottom, table.right, table.bottom) >
        (table.right - table.left) * rowHeight);

  Canvas printed(300, 200);
  SendMessageW(p.Window(), WM_PRINTCLIENT, reinterpret_cast<WPARAM>(printed.Dc()), PRF_CLIENT);
  CHECK(printed.SamePixels(drawn));
  Canvas whole(300, 200);
  CHECK(PrintWindow(p.Window(), whole.Dc(), 0));
  CHECK(whole.SamePixels(drawn));
  p.Close();
  CHECK(dll.CanUnloadNow() == S_OK);
}
