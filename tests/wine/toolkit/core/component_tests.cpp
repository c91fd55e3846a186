// cXComponent under Wine: creation and its error, the window class, fonts.
#include <doctest/doctest.h>

#include "tests/wine/common/toolkit_test_support.h"
#include "frame/errors/cErr.h"
#include "toolkit/core/toolkit_error.h"
#include "toolkit/core/ToolkitWindows.h"

using namespace toolkit;
using namespace tktest;

TEST_CASE("create under something that is not a window throws the toolkit error") {
  cXComponent c;
  unsigned code = 0;
  try {
    c.create(reinterpret_cast<HWND>(static_cast<INT_PTR>(0x7654)));
  } catch (const br::cErr& e) {
    code = e.code();
  }
  CHECK(code == kErrorBadParentWindow);
  CHECK_FALSE(c.isValid());
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

  ToolkitWindows::unregisterClasses();
  CHECK_FALSE(GetClassInfoExA(ToolkitWindows::moduleInstance(), "Brine_AWTATL7", &info));
  // The next window registers its class again.
  HostWindow host;
  cXComponent c;
  CHECK(c.create(host.hwnd()));
  CHECK(GetClassInfoExA(ToolkitWindows::moduleInstance(), "Brine_AWTATL1", &info));
}

TEST_CASE("fonts: own fonts are deleted by their component, lent fonts never") {
  HostWindow host;
  HFONT lent = CreateFontA(-12, 0, 0, 0, FW_NORMAL, 0, 0, 0, DEFAULT_CHARSET, 0, 0, 0, 0, "Arial");
  REQUIRE(lent != nullptr);
  HFONT own = nullptr;
  {
    cXComponent c;
    REQUIRE(c.create(host.hwnd()));
    REQUIRE(c.setFont("Arial", 10, true, false));
    own = c.ownFont();
    CHECK(reinterpret_cast<HFONT>(SendMessageA(c.getHandle(), WM_GETFONT, 0, 0)) == own);
    c.lendFont(lent);
    CHECK(c.getFont() == lent);
    // A new own font replaces (and deletes) the old one and ends the loan.
    REQUIRE(c.setFont("Courier New", 9, false, true));
    CHECK(GetObjectType(own) == 0);
    own = c.ownFont();
    CHECK(c.borrowedFont() == nullptr);
    c.lendFont(lent);
  }
  CHECK(GetObjectType(own) == 0);         // the component's own font died with it
  CHECK(GetObjectType(lent) == OBJ_FONT); // the lent one did not
  DeleteObject(lent);
}
