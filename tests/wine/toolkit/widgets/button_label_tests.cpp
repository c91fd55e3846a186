// Button driven with real mouse messages.
#include <doctest/doctest.h>

#include <windows.h>

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/widgets/Button.h"

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
