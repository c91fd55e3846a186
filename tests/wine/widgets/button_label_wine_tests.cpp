// Button and Label driven with real mouse messages, drawn into memory bitmaps.
#include <doctest/doctest.h>

#include <windows.h>
#include <commctrl.h>

#include "WidgetTestSupport.h"
#include "toolkit/widgets/Button.h"
#include "toolkit/widgets/Label.h"
#include "toolkit/widgets/support/MeasuringDC.h"

using namespace toolkit;
using namespace wtest;

namespace {

int actionsFrom(const RecordingPanel& panel, const cXComponent* source) {
  int n = 0;
  for (const Seen& s : panel.seen) n += s.id == kEventAction && s.source == source;
  return n;
}

HIMAGELIST twoColourImages() {
  HIMAGELIST images = ImageList_Create(16, 16, ILC_COLOR24, 2, 0);
  HDC screen = GetDC(nullptr);
  HDC dc = CreateCompatibleDC(screen);
  HBITMAP strip = CreateCompatibleBitmap(screen, 32, 16);
  HGDIOBJ old = SelectObject(dc, strip);
  RECT left{0, 0, 16, 16}, right{16, 0, 32, 16};
  HBRUSH red = CreateSolidBrush(RGB(255, 0, 0)), blue = CreateSolidBrush(RGB(0, 0, 255));
  FillRect(dc, &left, red);
  FillRect(dc, &right, blue);
  SelectObject(dc, old);
  ImageList_Add(images, strip, nullptr);
  DeleteObject(red);
  DeleteObject(blue);
  DeleteObject(strip);
  DeleteDC(dc);
  ReleaseDC(nullptr, screen);
  return images;
}

}  // namespace

TEST_CASE("a push button fires when released over itself, never when released outside") {
  MountedPanel panel;
  Button button("OK");
  panel.add(&button);
  button.setBounds(10, 10, 80, 24, true, true);
  HWND b = button.getHandle();
  REQUIRE(b);
  CHECK(button.getState() == Button::kStateRaised);

  press(b, WM_LBUTTONDOWN, 5, 5, MK_LBUTTON);
  CHECK(button.isPressed());
  CHECK(GetCapture() == b);
  CHECK(actionsFrom(panel, &button) == 0);  // a push button fires on release

  SUBCASE("dragged out and back in, released inside: fires once") {
    press(b, WM_MOUSEMOVE, 200, 5, MK_LBUTTON);
    CHECK_FALSE(button.isPressed());
    press(b, WM_MOUSEMOVE, 40, 12, MK_LBUTTON);
    CHECK(button.isPressed());
    press(b, WM_LBUTTONUP, 40, 12, 0);
    CHECK(actionsFrom(panel, &button) == 1);
    CHECK(GetCapture() == nullptr);
    CHECK(button.getState() == Button::kStateRaised);
  }
  SUBCASE("dragged out and released outside: no action") {
    press(b, WM_MOUSEMOVE, -30, 40, MK_LBUTTON);
    press(b, WM_LBUTTONUP, -30, 40, 0);
    CHECK(actionsFrom(panel, &button) == 0);
    CHECK(GetCapture() == nullptr);
    CHECK_FALSE(button.isPressed());
  }
  SUBCASE("released outside with no move in between: no action either") {
    press(b, WM_LBUTTONUP, 300, 300, 0);
    CHECK(actionsFrom(panel, &button) == 0);
  }
}

TEST_CASE("toggle and radio-like buttons fire on press") {
  MountedPanel panel;
  Button toggle("T"), r1("1"), r2("2"), r3("3"), push("P");
  toggle.kind = Button::kToggle;
  r1.kind = r2.kind = r3.kind = Button::kRadio;
  for (Button* b : {&toggle, &r1, &r2, &r3, &push}) {
    panel.add(b);
    b->setBounds(0, 0, 40, 20, true, true);
  }

  press(toggle.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  CHECK(toggle.isChecked());
  CHECK(actionsFrom(panel, &toggle) == 1);
  CHECK(GetCapture() != toggle.getHandle());
  press(toggle.getHandle(), WM_LBUTTONUP, 3, 3, 0);
  CHECK(toggle.isChecked());  // the release changes nothing
  press(toggle.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  CHECK_FALSE(toggle.isChecked());
  CHECK(actionsFrom(panel, &toggle) == 2);

  push.setChecked(true);  // a push button among them is left alone
  press(r1.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  press(r2.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  CHECK_FALSE(r1.isChecked());
  CHECK(r2.isChecked());
  CHECK(push.isChecked());
  press(r2.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  CHECK(r2.isChecked());  // pressing the pressed one keeps it pressed
  CHECK(actionsFrom(panel, &r2) == 2);
  r3.setChecked(true);
  CHECK_FALSE(r2.isChecked());
  CHECK(r3.isChecked());
}

TEST_CASE("a disabled button keeps still and fires nothing") {
  MountedPanel panel;
  Button button("Off"), toggle("T");
  toggle.kind = Button::kToggle;
  panel.add(&button);
  panel.add(&toggle);
  button.setEnabled(false);
  toggle.setEnabled(false);
  CHECK(button.getState() == (Button::kStateRaised | Button::kStateDisabled));
  for (Button* b : {&button, &toggle}) {
    press(b->getHandle(), WM_LBUTTONDOWN, 1, 1, MK_LBUTTON);
    press(b->getHandle(), WM_LBUTTONUP, 1, 1, 0);
    CHECK_FALSE(b->isPressed());
  }
  CHECK(panel.count(kEventAction) == 0);
  button.setEnabled(true);
  CHECK(button.getState() == Button::kStateRaised);
}

TEST_CASE("button faces: raised, pressed, disabled, colour overrides, images") {
  Button button("W");
  button.setColor(COLOR_BTNFACE, RGB(10, 20, 30));
  button.setColor(COLOR_BTNHIGHLIGHT, RGB(250, 250, 250));
  button.setColor(COLOR_BTNSHADOW, RGB(60, 60, 60));
  button.setColor(COLOR_WINDOWTEXT, RGB(200, 0, 0));
  button.setColor(COLOR_GRAYTEXT, RGB(0, 200, 0));
  button.setColor(COLOR_HIGHLIGHTTEXT, RGB(0, 0, 200));
  MountedPanel panel;
  panel.add(&button);
  button.setBounds(0, 0, 60, 30, true, true);

  {
    Canvas canvas(60, 30, RGB(255, 0, 255));
    button.drawButton(canvas.dc());
    CHECK(canvas.at(0, 0) == RGB(250, 250, 250));
    CHECK(canvas.at(4, 15) == RGB(10, 20, 30));
    CHECK(canvas.count(RGB(200, 0, 0)) > 0);  // the text
  }
  press(button.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  {
    Canvas canvas(60, 30, RGB(255, 0, 255));
    button.drawButton(canvas.dc());
    CHECK(canvas.at(0, 0) == RGB(60, 60, 60));
    CHECK(canvas.at(4, 15) == RGB(0, 200, 0));  // the face in the grey-text colour
    CHECK(canvas.count(RGB(0, 0, 200)) > 0);
  }
  press(button.getHandle(), WM_LBUTTONUP, 3, 3, 0);
  button.setEnabled(false);
  {
    Canvas canvas(60, 30, RGB(255, 0, 255));
    button.drawButton(canvas.dc());
    CHECK(canvas.count(RGB(0, 200, 0)) > 0);
  }

  HIMAGELIST images = twoColourImages();
  Button pictured(images, 0, 1);
  CHECK(pictured.imageSize().cx == 16);
  CHECK(str(pictured.getPreferredSize()) == "20x20");
  panel.add(&pictured);
  pictured.setBounds(0, 0, 30, 30, true, true);
  {
    Canvas canvas(30, 30, RGB(255, 0, 255));
    pictured.drawButton(canvas.dc());
    CHECK(canvas.at(15, 15) == RGB(255, 0, 0));
  }
  pictured.setEnabled(false);
  {
    Canvas canvas(30, 30, RGB(255, 0, 255));
    pictured.drawButton(canvas.dc());
    CHECK(canvas.at(15, 15) == RGB(0, 0, 255));  // the disabled image
  }
  panel.removeComponent(&pictured, false);
  ImageList_Destroy(images);  // borrowed: the button never frees it
}

TEST_CASE("button and label sizes from the text extent") {
  const Metrics ok = metricsOf("OK");
  Button button("OK");
  SIZE size = button.getPreferredSize();
  CHECK(str(size) == str(SIZE{2 * ok.tm.tmAveCharWidth + ok.measured.cx, 3 * ok.tm.tmDescent + ok.measured.cy + 2}));

  const Metrics two = metricsOf("a\rb");
  Button twoLines("a\rb");
  twoLines.setInsets(1, 2, 3, 4);
  size = twoLines.getPreferredSize();
  CHECK(size.cx == 2 * two.tm.tmAveCharWidth + two.measured.cx + 4);
  CHECK(size.cy == 5 * two.tm.tmDescent + two.measured.cy + 2 + 6);

  SUBCASE("an empty label measures like \"AAAAA\"") {
    Label empty, five("AAAAA"), one("A");
    const SIZE e = empty.getPreferredSize(), f = five.getPreferredSize();
    CHECK(str(e) == str(f));
    CHECK(one.getPreferredSize().cx < f.cx);
  }
  SUBCASE("without a screen DC: the fixed sizes") {
    MeasuringDC::simulateNoScreen(true);
    CHECK(str(Button("OK").getPreferredSize()) == "100x20");
    CHECK(Label("x").getPreferredSize().cx == 100);
    MeasuringDC::simulateNoScreen(false);
  }
}

TEST_CASE("a label squeezed into a narrow area halves its width and grows in height") {
  const char* text = "A rather long label text that will not fit";
  Label label(text);
  const SIZE full = label.getPreferredSize();
  const Metrics m = metricsOf(text);

  SIZE same = label.getPreferredSizeIn(RECT{0, 0, full.cx + 10, 50});
  CHECK(same.cx == full.cx);
  same = label.getPreferredSizeIn(RECT{0, 0, 0, 0});  // no area: no estimate
  CHECK(same.cx == full.cx);

  const int narrow = full.cx / 3;
  SIZE squeezed = label.getPreferredSizeIn(RECT{0, 0, narrow, 40});
  CHECK(squeezed.cx == full.cx / 2 / 2);  // two halvings, each adding two descents
  CHECK(squeezed.cy == full.cy + 4 * m.tm.tmDescent);

  squeezed = label.getPreferredSizeIn(RECT{0, 0, 1, 40});  // stops below three characters
  CHECK(squeezed.cx < 3 * m.tm.tmAveCharWidth);
  CHECK(squeezed.cx * 2 + 1 >= 3 * m.tm.tmAveCharWidth);
}

TEST_CASE("label drawing and redraw only on a real text change") {
  MountedPanel panel;
  Label label("Right", Label::kRight);
  label.setColor(COLOR_BTNFACE, RGB(1, 2, 3));
  label.setColor(COLOR_WINDOWTEXT, RGB(220, 0, 0));
  label.setColor(COLOR_GRAYTEXT, RGB(0, 220, 0));
  panel.add(&label);
  label.setBounds(0, 0, 200, 30, true, true);
  {
    Canvas canvas(200, 30, RGB(255, 0, 255));
    label.paint(canvas.dc());
    CHECK(canvas.at(0, 0) == RGB(1, 2, 3));
    CHECK(canvas.countIn(RGB(220, 0, 0), RECT{0, 0, 100, 30}) == 0);  // right-aligned
    CHECK(canvas.countIn(RGB(220, 0, 0), RECT{198, 0, 200, 30}) == 0);  // 2-pixel inset
  }
  label.setEnabled(false);
  {
    Canvas canvas(200, 30, RGB(255, 0, 255));
    label.paint(canvas.dc());
    CHECK(canvas.count(RGB(0, 220, 0)) > 0);
  }

  HWND h = label.getHandle();
  pump(20);
  ValidateRect(h, nullptr);
  label.setText("Right");
  CHECK_FALSE(GetUpdateRect(h, nullptr, FALSE));
  label.setText("right");  // exact comparison: case counts
  CHECK(GetUpdateRect(h, nullptr, FALSE));
  CHECK(label.getText() == "right");
}
