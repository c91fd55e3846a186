// cXComponent under Wine: without and with a window, the window class, bounds
// setters, text, colours, fonts and the shared palette.
#include <doctest/doctest.h>

#include "ToolkitTestSupport.h"
#include "frame/errors/cErr.h"
#include "toolkit/base/ClassRecords.h"
#include "toolkit/core/Palette.h"
#include "toolkit/core/ToolkitError.h"
#include "toolkit/core/ToolkitWindows.h"

using namespace toolkit;
using namespace tktest;

TEST_CASE("a component without a window answers the empty values and keeps only its text") {
  cXComponent c;
  CHECK(c.getClassRecord() == &records::cXComponent);
  CHECK_FALSE(c.isValid());
  CHECK(c.getHandle() == nullptr);
  CHECK_FALSE(c.isVisible());
  CHECK_FALSE(c.isEnabled());
  CHECK(str(c.getLocation()) == "(-1,-1)");
  CHECK(str(c.getSize()) == "0x0");
  CHECK(str(c.getWindowRect()) == str(RECT{}));

  c.setBounds(5, 6, 70, 80, true, true);
  c.moveTo(1, 2, 3, 4, true);
  c.setSize(50, 50, true);
  c.setLocation(9, 9);
  CHECK(str(c.bounds()) == str(RECT{}));

  c.setText("Depth");
  CHECK(c.getText() == "Depth");
  CHECK(c.getStyle() == 0);
  CHECK_FALSE(c.modifyStyle(0, WS_BORDER, 0));
  CHECK_FALSE(c.postEvent(std::make_unique<ToolkitEvent>(&c, kEventAction, nullptr)));
  CHECK(c.fireAction() == 0);  // no parent
  CHECK(str(c.getPreferredSize()) == "10x10");
  c.invalidate();
  c.repaintAll();
  c.destroyWindow();
}

TEST_CASE("create under something that is not a window throws the toolkit error") {
  cXComponent c;
  unsigned code = 0;
  try {
    c.create(reinterpret_cast<HWND>(static_cast<INT_PTR>(0x7654)));
  } catch (const cErr& e) {
    code = e.code();
  }
  CHECK(code == kErrorBadParentWindow);
  CHECK_THROWS_AS(c.create(nullptr), cErr);
  CHECK_FALSE(c.isValid());
}

TEST_CASE("create makes a child window of the toolkit class with the component style") {
  HostWindow host;
  cXComponent c;
  c.setText("Tide");
  REQUIRE(c.create(host.hwnd()));
  HWND h = c.getHandle();
  CHECK(wtest::windowClass(h) == "Brine_AWTATL1");
  CHECK(GetParent(h) == host.hwnd());
  CHECK(static_cast<DWORD>(c.getStyle()) == cXComponent::kDefaultStyle);
  CHECK(c.getText() == "Tide");  // a text set before the window exists is applied
  CHECK(ToolkitWindows::componentOf(h) == &c);

  // A second create leaves the window as it is.
  CHECK(c.create(host.hwnd()));
  CHECK(c.getHandle() == h);

  c.setText("Height");
  char text[32] = {};
  GetWindowTextA(h, text, sizeof(text));
  CHECK(std::string(text) == "Height");
  c.setTextNumber(-42);
  CHECK(c.getText() == "-42");

  c.destroyWindow();
  CHECK_FALSE(c.isValid());
  CHECK(ToolkitWindows::componentOf(h) == nullptr);
  CHECK(c.peer()->hwnd() == nullptr);
}

namespace {
LRESULT CALLBACK strayProc(HWND h, UINT m, WPARAM w, LPARAM l) { return DefWindowProcA(h, m, w, l); }
}  // namespace

TEST_CASE("a class left behind with another procedure is replaced; classes can be unregistered") {
  WNDCLASSEXA stray{};
  stray.cbSize = sizeof(stray);
  stray.lpfnWndProc = strayProc;
  stray.hInstance = ToolkitWindows::moduleInstance();
  stray.lpszClassName = "Brine_AWTATL7";
  REQUIRE(RegisterClassExA(&stray));
  REQUIRE(ToolkitWindows::registerClass(7));
  WNDCLASSEXA info{};
  info.cbSize = sizeof(info);
  REQUIRE(GetClassInfoExA(ToolkitWindows::moduleInstance(), "Brine_AWTATL7", &info));
  const bool replaced = info.lpfnWndProc == &ToolkitWindows::windowProc;
  CHECK(replaced);
  CHECK(ToolkitWindows::className(12) == "Brine_AWTATL12");

  ToolkitWindows::unregisterClasses();
  CHECK_FALSE(GetClassInfoExA(ToolkitWindows::moduleInstance(), "Brine_AWTATL7", &info));
  CHECK_FALSE(GetClassInfoExA(ToolkitWindows::moduleInstance(), "Brine_AWTATL1", &info));
  // The next window registers its class again.
  HostWindow host;
  cXComponent c;
  CHECK(c.create(host.hwnd()));
  CHECK(GetClassInfoExA(ToolkitWindows::moduleInstance(), "Brine_AWTATL1", &info));
}

TEST_CASE("bounds setters move the window and keep the bounds field") {
  HostWindow host;
  cXComponent c;
  REQUIRE(c.create(host.hwnd()));

  c.setBounds(10, 20, 100, 50, false, true);
  CHECK(str(placed(c)) == str(xywh(10, 20, 100, 50)));
  CHECK(str(c.bounds()) == str(xywh(10, 20, 100, 50)));
  CHECK(str(c.getLocation()) == "(110,120)");  // screen coordinates: the host is at (100, 100)
  CHECK(c.contains(150, 130));
  CHECK_FALSE(c.contains(50, 50));

  c.moveTo(5, 6, 30, 40, true);
  CHECK(str(placed(c)) == str(xywh(5, 6, 30, 40)));
  c.setLocation(50, 60);
  CHECK(str(placed(c)) == str(xywh(50, 60, 30, 40)));
  c.setSize(70, 80, true);
  CHECK(str(placed(c)) == str(xywh(50, 60, 70, 80)));
  CHECK(str(c.getSize()) == "70x80");

  // setLocation leaves a window of zero size alone.
  c.moveTo(1, 1, 0, 10, true);
  c.setLocation(40, 40);
  CHECK(str(placed(c)) == str(xywh(1, 1, 0, 10)));

  CHECK(c.modifyStyle(0, WS_BORDER, SWP_FRAMECHANGED));
  CHECK((c.getStyle() & WS_BORDER) != 0);
  CHECK_FALSE(c.modifyStyle(0, WS_BORDER, 0));
}

// The accepted indices are drawn in the button, label and edit cases.
TEST_CASE("setColor refuses indices other than the nine system ones") {
  cXComponent c;
  CHECK_FALSE(c.setColor(6, RGB(1, 2, 3)));
  CHECK(c.colorOf(6) == GetSysColor(6));
  for (int index : {4, 7, 19, 21}) CHECK_FALSE(c.setColor(index, 0));
}

TEST_CASE("the palette: whole replacement only, drawing by index") {
  Palette::reset();
  CHECK(Palette::colour(1) == 0x000080);
  CHECK(Palette::colour(20) == 0);
  CHECK(Palette::colour(-1) == 0);

  COLORREF table[21];
  for (int i = 0; i < 21; ++i) table[i] = RGB(i, 2 * i, 3 * i);
  cXComponent c;
  CHECK_FALSE(c.setPalette(table, 19));
  CHECK_FALSE(c.setPalette(table, 21));
  CHECK_FALSE(c.setPalette(nullptr, 20));
  CHECK(Palette::colour(1) == 0x000080);
  CHECK(c.setPalette(table, 20));
  CHECK(Palette::colour(1) == RGB(1, 2, 3));
  CHECK(Palette::colour(19) == RGB(19, 38, 57));

  wtest::Canvas canvas(8, 8, RGB(255, 0, 255));
  HDC dc = canvas.dc();
  Palette::fill(dc, RECT{0, 0, 8, 8}, 5);
  CHECK(canvas.at(3, 3) == RGB(5, 10, 15));
  Palette::reset();
}

TEST_CASE("fonts: own fonts are deleted by their component, lent fonts never") {
  HostWindow host;
  HFONT lent = CreateFontA(-12, 0, 0, 0, FW_NORMAL, 0, 0, 0, DEFAULT_CHARSET, 0, 0, 0, 0, "Arial");
  REQUIRE(lent != nullptr);
  HFONT own = nullptr;
  {
    cXComponent c;
    REQUIRE(c.create(host.hwnd()));
    CHECK(c.getFont() == nullptr);
    REQUIRE(c.setFont("Arial", 10, true, false));
    own = c.ownFont();
    REQUIRE(own != nullptr);
    CHECK(c.getFont() == own);
    CHECK(reinterpret_cast<HFONT>(SendMessageA(c.getHandle(), WM_GETFONT, 0, 0)) == own);
    LOGFONTA lf{};
    GetObjectA(own, sizeof(lf), &lf);
    CHECK(lf.lfWeight == FW_BOLD);

    c.lendFont(lent);
    CHECK(c.getFont() == lent);
    CHECK(c.ownFont() == own);
    CHECK(reinterpret_cast<HFONT>(SendMessageA(c.getHandle(), WM_GETFONT, 0, 0)) == lent);

    // A new own font replaces (and deletes) the old one and ends the loan.
    REQUIRE(c.setFont("Courier New", 9, false, true));
    CHECK(GetObjectType(own) == 0);
    own = c.ownFont();
    CHECK(c.getFont() == own);
    CHECK(c.borrowedFont() == nullptr);
    c.lendFont(lent);
  }
  CHECK(GetObjectType(own) == 0);         // the component's own font died with it
  CHECK(GetObjectType(lent) == OBJ_FONT); // the lent one did not
  DeleteObject(lent);
}

TEST_CASE("the base inputBox answers -1 and leaves the result alone") {
  cXComponent c;
  std::string result = "kept";
  CHECK(c.inputBox("Name?", result, 1) == -1);
  CHECK(result == "kept");
}
