// Button driven with real mouse messages; Label's text as drawn.
#include <doctest/doctest.h>

#include <windows.h>

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/widgets/Button.h"
#include "toolkit/widgets/Label.h"

using namespace toolkit;
using namespace wtest;

TEST_CASE("a push button fires when released over itself, never when released outside") {
  MountedPanel panel;
  Button button("OK");
  panel.add(&button);
  button.setBounds(10, 10, 80, 24, true, true);
  HWND b = button.getHandle();
  REQUIRE(b);

  press(b, WM_LBUTTONDOWN, 5, 5, MK_LBUTTON);
  CHECK(button.isPressed());
  CHECK(GetCapture() == b);
  CHECK(panel.count(kEventAction) == 0);  // a push button fires on release

  SUBCASE("dragged out and back in, released inside: fires once") {
    press(b, WM_MOUSEMOVE, 200, 5, MK_LBUTTON);
    CHECK_FALSE(button.isPressed());
    press(b, WM_MOUSEMOVE, 40, 12, MK_LBUTTON);
    press(b, WM_LBUTTONUP, 40, 12, 0);
    CHECK(panel.count(kEventAction) == 1);
    CHECK(GetCapture() == nullptr);
  }
  SUBCASE("released outside: no action") {
    press(b, WM_LBUTTONUP, 300, 300, 0);
    CHECK(panel.count(kEventAction) == 0);
    CHECK_FALSE(button.isPressed());
  }
}

TEST_CASE("toggle and radio-like buttons fire on press; a disabled one fires nothing") {
  MountedPanel panel;
  Button toggle("T"), r1("1"), r2("2"), push("P");
  toggle.kind = Button::kToggle;
  r1.kind = r2.kind = Button::kRadio;
  for (Button* b : {&toggle, &r1, &r2, &push}) panel.add(b);

  press(toggle.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  CHECK(toggle.isChecked());
  CHECK(panel.count(kEventAction) == 1);
  press(toggle.getHandle(), WM_LBUTTONUP, 3, 3, 0);
  CHECK(toggle.isChecked());  // the release changes nothing

  push.setChecked(true);  // a push button among them is left alone
  press(r1.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  press(r2.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  CHECK_FALSE(r1.isChecked());
  CHECK(r2.isChecked());
  CHECK(push.isChecked());

  r1.setEnabled(false);
  CHECK(r1.getState() == (Button::kStateRaised | Button::kStateDisabled));
  press(r1.getHandle(), WM_LBUTTONDOWN, 1, 1, MK_LBUTTON);
  CHECK_FALSE(r1.isChecked());
  CHECK(r2.isChecked());
  CHECK(panel.count(kEventAction) == 3);
}

TEST_CASE("either mouse button presses a button") {
  MountedPanel panel;
  Button push("OK"), toggle("T");
  toggle.kind = Button::kToggle;
  panel.add(&push);
  panel.add(&toggle);
  push.setBounds(10, 10, 80, 24, true, true);

  press(push.getHandle(), WM_RBUTTONDOWN, 5, 5, MK_RBUTTON);
  CHECK(push.isPressed());
  CHECK(GetCapture() == push.getHandle());
  press(push.getHandle(), WM_RBUTTONUP, 5, 5, 0);
  CHECK_FALSE(push.isPressed());
  CHECK(panel.count(kEventAction) == 1);

  press(toggle.getHandle(), WM_RBUTTONDOWN, 3, 3, MK_RBUTTON);
  CHECK(toggle.isChecked());
  CHECK(panel.count(kEventAction) == 2);
}

namespace {

// Rows of `area` holding at least one pixel that is not the label's face colour.
int inkedRows(const Canvas& canvas, COLORREF face, const RECT& area) {
  int rows = 0;
  for (int y = area.top; y < area.bottom; ++y) {
    const RECT row{area.left, y, area.right, y + 1};
    if (canvas.countIn(face, row) < area.right - area.left) ++rows;
  }
  return rows;
}

}  // namespace

// DrawText centres vertically only single lines; a label's text is not made one, so it is
// laid from the top, breaks only where it holds a line break and is cut at the right edge.
TEST_CASE("a label draws its text from the top, one line per line break, never wrapped") {
  MountedPanel panel;
  Label label("Keep the new chart?");
  panel.add(&label);
  label.setBounds(0, 0, 50, 80, true, true);
  TEXTMETRICA tm{};
  {
    HDC screen = GetDC(nullptr);
    HGDIOBJ font = label.getFont() ? static_cast<HGDIOBJ>(label.getFont()) : GetStockObject(DEFAULT_GUI_FONT);
    HGDIOBJ old = SelectObject(screen, font);
    GetTextMetricsA(screen, &tm);
    SelectObject(screen, old);
    ReleaseDC(nullptr, screen);
  }
  REQUIRE((tm.tmHeight > 0 && tm.tmHeight * 3 < 80));
  const RECT firstLine{0, 0, 50, tm.tmHeight};
  const RECT secondLine{0, tm.tmHeight, 50, 2 * tm.tmHeight};
  const RECT below{0, 2 * tm.tmHeight, 50, 80};

  Canvas wide(50, 80, RGB(1, 2, 3));
  label.paint(wide.dc());
  const COLORREF face = wide.at(0, 79);
  CHECK(inkedRows(wide, face, firstLine) > 0);
  CHECK(inkedRows(wide, face, secondLine) == 0);  // too wide for 50 pixels, yet one line
  CHECK(inkedRows(wide, face, below) == 0);

  label.setText("Keep\r\nit");
  Canvas twoLines(50, 80, RGB(1, 2, 3));
  label.paint(twoLines.dc());
  CHECK(inkedRows(twoLines, face, firstLine) > 0);
  CHECK(inkedRows(twoLines, face, secondLine) > 0);
  CHECK(inkedRows(twoLines, face, below) == 0);
}
