// cXEdit2 driven with real key, character and mouse messages.
#include <doctest/doctest.h>

#include <cmath>

#include "WidgetTestSupport.h"
#include "toolkit/widgets/cXEdit2.h"

using namespace toolkit;
using namespace wtest;

namespace {

// A host, a recording panel and an edit 160 x 24 inside it.
struct EditBench {
  MountedPanel panel;
  cXEdit2 edit;
  HWND h = nullptr;

  explicit EditBench(int maxLength = 0, int width = 160) : edit(maxLength) {
    panel.add(&edit);
    edit.setBounds(10, 10, width, 24, true, true);
    h = edit.getHandle();
    setModifiers(false, false);
  }
  ~EditBench() { setModifiers(false, false); }

  int bubbled(int id) const { return panel.count(id); }
};

int charX(HWND h, const std::string& text, int index) {
  HDC dc = GetDC(h);
  HGDIOBJ old = SelectObject(dc, GetStockObject(DEFAULT_GUI_FONT));
  SIZE extent{0, 0};
  if (index > 0) GetTextExtentPoint32A(dc, text.c_str(), index, &extent);
  SelectObject(dc, old);
  ReleaseDC(h, dc);
  return cXEdit2::kMargin + extent.cx;
}

}  // namespace

// What each edit type makes of a character is the native edit suites'; here the routing.
TEST_CASE("characters typed reach the model; refused ones bubble, the edit's keys do not") {
  // type, mask, limit, start value (NaN: none), End first, characters, text, characters that bubbled
  struct Row { int type; const char* mask; int limit; double value; bool end; const char *typed, *text; int bubbled; };
  const Row rows[] = {
      {kEditLatitude, nullptr, 0, -12.5, true, "nx", "12\xB0" "30.000'N", 1},  // 'n' taken, 'x' refused
      {kEditInteger, nullptr, 6, NAN, false, "1234567-", "123456", 2},
      {kEditText, "-99:99", 0, NAN, false, "-1234", "-12:34", 0},
  };
  for (const Row& row : rows) {
    CAPTURE(row.typed);
    EditBench b(row.limit);
    REQUIRE(b.edit.setEditType(row.type, row.mask));
    if (!std::isnan(row.value)) REQUIRE(b.edit.setValue(row.value));
    if (row.end) key(b.h, VK_END);
    typeText(b.h, row.typed);
    CHECK(b.edit.getText() == row.text);
    CHECK(b.bubbled(kEventChar) == row.bubbled);
    key(b.h, VK_HOME);
    key(b.h, VK_DELETE);  // Delete is taken too: never bubbles
    CHECK(b.bubbled(kEventKeyDown) == 0);
  }
}

// Insert, overwrite and Shift selection are the native edit suites'; here what bubbles.
TEST_CASE("free text edit: control characters and foreign keys bubble, Ctrl+A and Backspace do not") {
  EditBench b;
  b.edit.setText("hello");
  key(b.h, VK_END);
  typeText(b.h, " you");
  CHECK(b.edit.getText() == "hello you");
  typeChar(b.h, '\t');  // control characters are not text
  CHECK(b.bubbled(kEventChar) == 1);

  setModifiers(false, true);
  key(b.h, 'A');
  typeChar(b.h, 0x01);  // the character Ctrl+A makes is consumed as well
  setModifiers(false, false);
  CHECK(b.bubbled(kEventChar) == 1);
  CHECK(b.edit.getSelectionLength() == -9);
  key(b.h, VK_BACK);
  CHECK(b.edit.getText().empty());
  CHECK(b.bubbled(kEventKeyDown) == 0);

  key(b.h, VK_RETURN);
  key(b.h, VK_UP);
  CHECK(b.bubbled(kEventKeyDown) == 2);  // keys that are not the edit's go on
}

TEST_CASE("month edit: starts today, texts through the platform's date format, no paste") {
  EditBench b;
  REQUIRE(b.edit.setEditType(kEditMonth));
  SYSTEMTIME now{};
  GetLocalTime(&now);
  char expected[32] = {};
  GetDateFormatA(LOCALE_SYSTEM_DEFAULT, 0, &now, "MM-yyyy", expected, static_cast<int>(sizeof(expected)));
  CHECK(b.edit.getText() == expected);
  CHECK(b.edit.getNoPaste());

  REQUIRE(b.edit.setValue(45427.0));  // 2024-05-15
  CHECK(b.edit.getText() == "05-2024");

  REQUIRE(b.edit.setEditType(kEditMonth, "dd.MM.yyyy"));
  REQUIRE(b.edit.setValue(45427.0));
  CHECK(b.edit.getText() == "15.05.2024");
}

TEST_CASE("keys are the edit's only while its window is visible") {
  EditBench b;
  b.edit.setText("abc");
  b.edit.show(false);
  key(b.h, VK_BACK);
  typeChar(b.h, 'x');
  CHECK(b.edit.getText() == "abc");
  CHECK(b.bubbled(kEventKeyDown) == 1);
  CHECK(b.bubbled(kEventChar) == 1);
}

TEST_CASE("a click places the caret; a drag selects in free text only") {
  EditBench b;
  const std::string text = "abcdefgh";
  b.edit.setText(text);
  const int x3 = charX(b.h, text, 3), x6 = charX(b.h, text, 6);
  press(b.h, WM_LBUTTONDOWN, x3, 10, MK_LBUTTON);
  CHECK(b.edit.getCaret() == 3);
  CHECK(GetCapture() == b.h);
  press(b.h, WM_MOUSEMOVE, x6 + 1, 10, MK_LBUTTON);
  CHECK(b.edit.getCaret() == 6);
  CHECK(b.edit.getSelectionLength() == -3);
  press(b.h, WM_LBUTTONUP, x6 + 1, 10, 0);
  CHECK(GetCapture() == nullptr);
  press(b.h, WM_LBUTTONDOWN, 150, 10, MK_LBUTTON);  // beyond the text
  press(b.h, WM_LBUTTONUP, 150, 10, 0);
  CHECK(b.edit.getCaret() == 8);
  CHECK(b.edit.getSelectionLength() == 0);

  REQUIRE(b.edit.setEditType(kEditLatitude));
  REQUIRE(b.edit.setValue(1.0));
  const std::string coord = b.edit.getText();
  press(b.h, WM_LBUTTONDOWN, charX(b.h, coord, 2) + 1, 10, MK_LBUTTON);  // on the degree sign
  CHECK((b.edit.getCaret() == 1 || b.edit.getCaret() == 3));
  CHECK(GetCapture() != b.h);  // no drag selection in coordinates
  press(b.h, WM_MOUSEMOVE, charX(b.h, coord, 8), 10, MK_LBUTTON);
  CHECK(b.edit.getSelectionLength() == 0);
}

TEST_CASE("painting: one off-screen copy covers the client area; selection colours") {
  EditBench b;
  b.edit.setColor(COLOR_WINDOW, RGB(5, 6, 7));
  b.edit.setColor(COLOR_HIGHLIGHT, RGB(0, 0, 160));
  b.edit.setColor(COLOR_WINDOWTEXT, RGB(170, 0, 0));
  b.edit.setText("WWWWWW");
  b.edit.setCaret(0, 3);
  Canvas canvas(160, 24, RGB(255, 0, 255));
  b.edit.paint(canvas.dc());
  CHECK(canvas.count(RGB(255, 0, 255)) == 0);
  CHECK(canvas.at(159, 0) == RGB(5, 6, 7));
  const int x3 = charX(b.h, "WWWWWW", 3), x6 = charX(b.h, "WWWWWW", 6);
  CHECK(canvas.countIn(RGB(0, 0, 160), RECT{cXEdit2::kMargin, 0, x3, 24}) > 0);
  CHECK(canvas.countIn(RGB(0, 0, 160), RECT{x3, 0, 160, 24}) == 0);
  CHECK(canvas.countIn(RGB(170, 0, 0), RECT{x3, 0, x6, 24}) > 0);
  CHECK(canvas.countIn(RGB(170, 0, 0), RECT{0, 0, x3, 24}) == 0);
}

TEST_CASE("a long text scrolls to keep the caret in view") {
  EditBench b(0, 40);
  b.edit.setText("a long line of text that is much wider than forty pixels");
  CHECK(b.edit.getScrollOffset() == 0);
  key(b.h, VK_END);
  CHECK(b.edit.getScrollOffset() > 0);
  key(b.h, VK_HOME);
  CHECK(b.edit.getScrollOffset() == 0);
}
