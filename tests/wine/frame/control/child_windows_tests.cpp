// Pictures of child windows composed into a memory bitmap: toolkit components painted by
// themselves, other windows asked with WM_PRINTCLIENT, each in its place, clipped to its
// parent, the upper of two overlapping windows over the lower, hidden ones left out.
#include "frame/control/child_windows.h"

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/core/Palette.h"
#include "toolkit/core/Panel.h"

#include <doctest/doctest.h>

namespace {

// A toolkit panel painted in one palette colour.
class Swatch final : public toolkit::Panel {
public:
  explicit Swatch(int colour) : colour_(colour) {}
  void paint(HDC dc) override { toolkit::Palette::fill(dc, getClientRect(), colour_); }

private:
  int colour_;
};

constexpr COLORREF kPrinted = RGB(0x20, 0x40, 0x60);

// A window of another kind that only pictures itself through WM_PRINTCLIENT.
LRESULT CALLBACK PrintedProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_PRINTCLIENT) {
    RECT client{};
    GetClientRect(window, &client);
    HBRUSH brush = CreateSolidBrush(kPrinted);
    FillRect(reinterpret_cast<HDC>(wParam), &client, brush);
    DeleteObject(brush);
    return 0;
  }
  return DefWindowProcW(window, message, wParam, lParam);
}

HWND MakePrinted(HWND parent, int x, int y, int w, int h) {
  WNDCLASSW wc{};
  if (!GetClassInfoW(GetModuleHandleW(nullptr), L"BR_Info_TestPrinted", &wc)) {
    wc.lpfnWndProc = PrintedProcedure;
    wc.hInstance = GetModuleHandleW(nullptr);
    wc.lpszClassName = L"BR_Info_TestPrinted";
    RegisterClassW(&wc);
  }
  return CreateWindowExW(0, L"BR_Info_TestPrinted", L"", WS_CHILD | WS_VISIBLE, x, y, w, h, parent, nullptr,
                         GetModuleHandleW(nullptr), nullptr);
}

void Place(toolkit::cXComponent& component, HWND parent, int x, int y, int w, int h) {
  REQUIRE(component.create(parent));
  component.setBounds(x, y, w, h, true, false);
}

}  // namespace

TEST_CASE("child windows are composed in place, clipped to their parents, upper over lower, hidden ones left out") {
  const COLORREF red = toolkit::Palette::colour(9), green = toolkit::Palette::colour(10);
  const COLORREF blue = toolkit::Palette::colour(12), yellow = toolkit::Palette::colour(11);
  const COLORREF background = RGB(1, 2, 3);
  wtest::HostWindow host(200, 100);
  Swatch outer(9), inner(10), upper(12), hidden(11);
  Place(outer, host.hwnd(), 10, 10, 60, 40);
  Place(inner, outer.getHandle(), 40, 5, 50, 10);  // its right part lies outside the outer swatch
  Place(upper, host.hwnd(), 50, 30, 40, 40);       // over the outer swatch's lower right corner
  SetWindowPos(upper.getHandle(), HWND_TOP, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE);
  Place(hidden, host.hwnd(), 150, 60, 20, 20);
  ShowWindow(hidden.getHandle(), SW_HIDE);
  const HWND printed = MakePrinted(host.hwnd(), 120, 10, 30, 20);

  wtest::Canvas canvas(200, 100, background);
  br::control::PaintChildWindows(host.hwnd(), canvas.dc());
  CHECK(canvas.countIn(red, wtest::xywh(10, 10, 60, 40)) == 60 * 40 - 20 * 10 - 20 * 20);
  CHECK(canvas.countIn(green, wtest::xywh(50, 15, 20, 10)) == 20 * 10);  // 40 + 50 cut at the outer's 60
  CHECK(canvas.countIn(green, wtest::xywh(70, 0, 130, 100)) == 0);
  CHECK(canvas.countIn(blue, wtest::xywh(50, 30, 40, 40)) == 40 * 40);
  CHECK(canvas.countIn(kPrinted, wtest::xywh(120, 10, 30, 20)) == 30 * 20);
  CHECK(canvas.countIn(yellow, wtest::xywh(0, 0, 200, 100)) == 0);
  CHECK(canvas.countIn(background, wtest::xywh(0, 0, 200, 100)) ==
        200 * 100 - (60 * 40 + 40 * 40 - 20 * 20) - 30 * 20);  // the two swatches' union, the printed window

  // Drawn at another origin of the canvas, and the canvas's state left as it was.
  wtest::Canvas shifted(200, 100, background);
  SetViewportOrgEx(shifted.dc(), 5, 7, nullptr);
  IntersectClipRect(shifted.dc(), 0, 0, 100, 100);
  RECT clipBefore{};
  GetClipBox(shifted.dc(), &clipBefore);
  br::control::PaintChildWindows(host.hwnd(), shifted.dc());
  CHECK(shifted.at(15, 17) == red);
  CHECK(shifted.at(14, 16) == background);
  POINT origin{};
  GetViewportOrgEx(shifted.dc(), &origin);
  CHECK((origin.x == 5 && origin.y == 7));
  RECT clip{};
  GetClipBox(shifted.dc(), &clip);
  CHECK(wtest::str(clip) == wtest::str(clipBefore));
  CHECK(shifted.countIn(kPrinted, wtest::xywh(0, 0, 200, 100)) == 0);  // outside the clip
  DestroyWindow(printed);
}
