// The message box and input box shown over a component and answered from inside their
// modal loop, as a person answers them.
#include <doctest/doctest.h>

#include <windows.h>

#include <string>
#include <vector>

#include "tests/wine/common/widget_test_support.h"
#include "tests/wine/toolkit/dialogs/DialogDriver.h"
#include "toolkit/core/Panel.h"
#include "toolkit/dialogs/ModalDialog.h"
#include "toolkit/widgets/Button.h"
#include "toolkit/widgets/Label.h"

using namespace toolkit;
using br::test::DialogDriver;
using br::test::ShownDialog;
using Labels = std::vector<std::string>;

namespace {

// A component with a window inside a host window, to ask from.
struct Owner {
  wtest::HostWindow host{400, 300};
  Panel panel;
  explicit Owner(int width = 200, int height = 100) {
    REQUIRE(panel.create(host.hwnd()));
    panel.setBounds(30, 40, width, height, true, true);
  }
};

int width(const RECT& r) { return r.right - r.left; }

std::string textOf(HWND hwnd) {
  std::string s(static_cast<std::size_t>(GetWindowTextLengthA(hwnd)) + 1, '\0');
  s.resize(static_cast<std::size_t>(GetWindowTextA(hwnd, &s[0], static_cast<int>(s.size()))));
  return s;
}

}  // namespace

TEST_CASE("message box buttons, labels and results by style") {
  Owner owner;
  struct Case {
    unsigned style;
    const char* buttonText;
    Labels labels;
    const char* press;
    int result;
  };
  const Case cases[] = {
      {0, nullptr, {"OK"}, "OK", IDOK},
      {0, "", {"OK"}, "OK", IDOK},
      {0, "Close chart", {"Close chart"}, "OK", IDOK},
      {4, nullptr, {"YES", "NO"}, "OK", IDYES},  // the YES button is named "OK"
      {4, "ignored", {"YES", "NO"}, "NO", IDNO},
      {3, nullptr, {"YES", "NO", "Cancel"}, "OK", IDYES},
      {3, nullptr, {"YES", "NO", "Cancel"}, "NO", IDNO},
      {3, nullptr, {"YES", "NO", "Cancel"}, "CANCEL", IDCANCEL},
      {MB_YESNO | MB_ICONQUESTION, nullptr, {"YES", "NO"}, "NO", IDNO},
  };
  for (const Case& c : cases) {
    CAPTURE(c.style);
    CAPTURE(c.press);
    Labels seen;
    std::string message;
    DialogDriver driver({[&](ShownDialog& d) {
      seen = d.labels();
      if (auto* text = d.root ? d.root->findNamed("TEXT") : nullptr) message = text->getText();
      d.click(c.press);
    }});
    CHECK(owner.panel.messageBox("Keep the new chart?", c.style, c.buttonText) == c.result);
    CHECK(driver.shown() == 1);
    CHECK(seen == c.labels);
    CHECK(message == "Keep the new chart?");
  }
}

TEST_CASE("the buttons of a row are equally wide, level and centred") {
  Owner owner(300, 120);
  for (const bool input : {false, true}) {
    CAPTURE(input);
    std::vector<RECT> rects;
    RECT row{};
    DialogDriver driver({[&](ShownDialog& d) {
      for (Button* b : d.buttons) rects.push_back(b->getWindowRect());
      if (auto* r = d.root->findNamed("BUTTONS")) row = r->getWindowRect();
      d.click("CANCEL");
    }});
    std::string result = "unchanged";
    const int answer = input ? owner.panel.inputBox("Name", result, 3) : owner.panel.messageBox("Sure?", 3, nullptr);
    CHECK(answer == IDCANCEL);
    CHECK(result == "unchanged");
    REQUIRE(rects.size() == 3);
    // Cancel's narrower insets (or shorter padding) do not make it narrower.
    CHECK(width(rects[0]) > 10);
    CHECK(width(rects[1]) == width(rects[0]));
    CHECK(width(rects[2]) == width(rects[0]));
    CHECK(rects[1].top == rects[0].top);
    CHECK(rects[2].top == rects[0].top);
    // 5 pixels apart, the row centred within one pixel of integer division.
    CHECK(rects[1].left - rects[0].right == 5);
    CHECK(rects[2].left - rects[1].right == 5);
    const int leftGap = rects[0].left - row.left;
    const int rightGap = row.right - rects[2].right;
    CHECK(std::abs(leftGap - (rightGap - 5)) <= 1);  // the row's width counts a trailing gap
  }
}

TEST_CASE("the box covers its owner exactly, however small") {
  for (const SIZE size : {SIZE{200, 100}, SIZE{6, 4}}) {
    CAPTURE(size.cx);
    Owner owner(size.cx, size.cy);
    RECT shown{};
    bool visible = false;
    DialogDriver driver({[&](ShownDialog& d) {
      shown = d.rect;
      visible = IsWindowVisible(d.window) != FALSE;
      PostMessageA(d.window, WM_CLOSE, 0, 0);
    }});
    CHECK(owner.panel.messageBox("Depth unknown", 0, nullptr) == IDCANCEL);
    const RECT wanted = owner.panel.getWindowRect();
    CHECK(visible);
    CHECK(wtest::str(shown) == wtest::str(wanted));
    CHECK(width(shown) == size.cx);
  }
}

TEST_CASE("the box lends the owner's font to its components") {
  Owner owner;
  REQUIRE(owner.panel.setFont("Arial", 14, true, false));
  HFONT buttonFont = nullptr, labelFont = nullptr;
  DialogDriver driver({[&](ShownDialog& d) {
    buttonFont = d.buttons.at(0)->getFont();
    labelFont = d.root->findNamed("TEXT")->getFont();
    d.click("OK");
  }});
  CHECK(owner.panel.messageBox("Tide data is old", 0, "Understood") == IDOK);
  CHECK(buttonFont == owner.panel.getFont());
  CHECK(labelFont == owner.panel.getFont());
}

TEST_CASE("a box without buttons ends with Esc or the close command") {
  Owner owner;
  for (const unsigned style : {1u, 2u, 5u, 7u}) {
    CAPTURE(style);
    std::size_t buttons = 99;
    DialogDriver esc({[&](ShownDialog& d) {
      buttons = d.buttons.size();
      d.postKey(VK_RETURN);  // nothing to press: ignored
      d.postKey(VK_ESCAPE);
    }});
    CHECK(owner.panel.messageBox("Loading", style, nullptr) == IDCANCEL);
    CHECK(buttons == 0);
  }
  for (const unsigned style : {2u, 5u}) {
    CAPTURE(style);
    std::string result = "kept";
    DialogDriver closer({[&](ShownDialog& d) {
      SetWindowTextA(d.edit, "typed but never taken");
      PostMessageA(d.window, WM_SYSCOMMAND, SC_CLOSE, 0);
    }});
    CHECK(owner.panel.inputBox("Waiting", result, style) == IDCANCEL);
    CHECK(result == "kept");
  }
}

TEST_CASE("Esc and Enter in boxes with buttons") {
  Owner owner;
  SUBCASE("Esc answers Cancel where there is one, OK in a lone-OK message box") {
    DialogDriver driver({[](ShownDialog& d) { d.postKey(VK_ESCAPE); },
                         [](ShownDialog& d) { d.postKey(VK_ESCAPE); }});
    CHECK(owner.panel.messageBox("a", 3, nullptr) == IDCANCEL);
    CHECK(owner.panel.messageBox("b", 0, nullptr) == IDOK);
  }
  SUBCASE("a Yes/No box must be answered: Esc is ignored") {
    DialogDriver driver({[](ShownDialog& d) {
      d.postKey(VK_ESCAPE);
      wtest::pump(30);  // the key has been handled and left the box open
      CHECK(IsWindowEnabled(d.window));
      d.click("NO");
    }});
    CHECK(owner.panel.messageBox("c", 4, nullptr) == IDNO);
  }
  SUBCASE("Enter in the typing field is the OK button") {
    std::string result;
    DialogDriver driver({[](ShownDialog& d) {
      SetWindowTextA(d.edit, "Outer Mole");
      SetFocus(d.edit);
      d.postKey(VK_RETURN);
    }});
    CHECK(owner.panel.inputBox("Name", result, 1) == IDYES);
    CHECK(result == "Outer Mole");
  }
}

TEST_CASE("the input box: prompt, padded labels, typed text copied on OK") {
  Owner owner;
  struct Case {
    unsigned style;
    Labels labels;
    const char* press;
    int result;
    bool copies;
  };
  const Case cases[] = {
      {0, {"    OK    "}, "OK", IDYES, true},
      {1, {"    OK    ", "  Cancel  "}, "OK", IDYES, true},
      {1, {"    OK    ", "  Cancel  "}, "CANCEL", IDCANCEL, false},
      {4, {"    YES    ", "    NO    "}, "OK", IDYES, true},
      {4, {"    YES    ", "    NO    "}, "NO", IDNO, false},
      {3, {"    YES    ", "    NO    ", "  Cancel  "}, "NO", IDNO, false},
  };
  for (const Case& c : cases) {
    CAPTURE(c.style);
    CAPTURE(c.press);
    std::string result = "before";
    Labels seen;
    std::string prompt;
    DialogDriver driver({[&](ShownDialog& d) {
      seen = d.labels();
      prompt = d.root->findNamed("TEXT")->getText();
      REQUIRE(d.edit);
      SetWindowTextA(d.edit, "Pilot station");
      d.click(c.press);
    }});
    CHECK(owner.panel.inputBox("Station name?", result, c.style) == c.result);
    CHECK(seen == c.labels);
    CHECK(prompt == "Station name?");
    CHECK(result == (c.copies ? "Pilot station" : "before"));
  }
}

TEST_CASE("the input box reads its field whole, or empty") {
  Owner owner;
  SUBCASE("an empty field gives an empty text") {
    std::string result = "before";
    DialogDriver driver({[](ShownDialog& d) { d.click("OK"); }});
    CHECK(owner.panel.inputBox("Station name?", result, 0) == IDYES);
    CHECK(result.empty());
  }
  SUBCASE("a long text is read whole") {
    std::string typed;
    for (int i = 0; typed.size() < 40000; ++i) typed += "Buoy " + std::to_string(i) + "; ";
    std::string result;
    DialogDriver driver({[&](ShownDialog& d) {
      SetWindowTextA(d.edit, typed.c_str());
      CHECK(textOf(d.edit).size() == typed.size());  // the field has no length limit
      d.click("OK");
    }});
    CHECK(owner.panel.inputBox("Notes", result, 1) == IDYES);
    CHECK(result.size() == typed.size());
    CHECK(result == typed);
  }
}

TEST_CASE("the typing field lies over its place-holder, inside the box") {
  Owner owner(260, 140);
  RECT field{}, holder{};
  HWND fieldParent = nullptr;
  DialogDriver driver({[&](ShownDialog& d) {
    GetWindowRect(d.edit, &field);
    holder = d.root->findNamed("EDIT")->getWindowRect();
    fieldParent = GetParent(d.edit);
    CHECK(IsWindowVisible(d.edit));
    CHECK(GetFocus() == d.edit);
    // The field sits above the components in the z-order, so clicks reach it.
    POINT centre{(field.left + field.right) / 2, (field.top + field.bottom) / 2};
    ScreenToClient(d.window, &centre);
    CHECK(ChildWindowFromPointEx(d.window, centre, CWP_SKIPINVISIBLE) == d.edit);
    d.click("CANCEL");
  }});
  std::string result;
  CHECK(owner.panel.inputBox("Berth", result, 1) == IDCANCEL);
  CHECK(width(holder) > 20);
  CHECK(wtest::str(field) == wtest::str(RECT{holder.left + 1, holder.top + 1, holder.right - 1, holder.bottom - 1}));
  CHECK(fieldParent != nullptr);
}

TEST_CASE("a box opened from a box: each answers for itself") {
  Owner owner;
  int inner = 0;
  std::string innerText = "unchanged";
  RECT outerRect{}, innerRect{};
  DialogDriver driver({
      [&](ShownDialog& d) {
        outerRect = d.rect;
        // Ask again from a component of the open box: a second loop inside the first.
        cXComponent* text = d.root->findNamed("TEXT");
        inner = text->inputBox("Why?", innerText, 1);
        CHECK(IsWindowEnabled(d.window));  // the inner box has gone and given it back
        d.click("NO");
      },
      [&](ShownDialog& d) {
        innerRect = d.rect;
        SetWindowTextA(d.edit, "depth changed");
        d.click("OK");
      },
  });
  CHECK(owner.panel.messageBox("Outer", 4, nullptr) == IDNO);
  CHECK(driver.shown() == 2);
  CHECK(inner == IDYES);
  CHECK(innerText == "depth changed");
  CHECK(wtest::str(outerRect) == wtest::str(owner.panel.getWindowRect()));
  CHECK(width(innerRect) < width(outerRect));  // the inner one covers the label only

  // Nothing of either is left bound to the thread: the next box is a box of its own.
  DialogDriver after({[](ShownDialog& d) { d.click("OK"); }});
  CHECK(owner.panel.messageBox("Again", 0, nullptr) == IDOK);
  CHECK(after.shown() == 1);
}

TEST_CASE("a component without a window answers -1 at once") {
  Panel loose;
  Label label("floating");
  DialogDriver driver({});
  std::string result = "kept";
  SetLastError(0);
  CHECK(loose.messageBox("x", 0, nullptr) == -1);
  CHECK(GetLastError() != 0);
  CHECK(label.inputBox("y", result, 1) == -1);
  CHECK(result == "kept");
  wtest::pump(30);
  CHECK(driver.shown() == 0);
}

namespace {

// A control's panel that asks from its own button's action, inside the toolkit's window
// procedure: the box's components are let go while toolkit calls are still on the stack.
class AskingPanel : public Panel {
public:
  Button ask{"Rename"};
  std::string name = "Le Minou";
  int answer = 0;
  AskingPanel() { add(&ask, "ASK"); }
  int onAction(ToolkitEvent& event) override {
    if (event.source != &ask) return 0;
    answer = inputBox("New name", name, 1);
    return 1;
  }
};

}  // namespace

TEST_CASE("a box asked from a button's action, inside the toolkit's window procedure") {
  wtest::HostWindow host;
  AskingPanel panel;
  REQUIRE(panel.create(host.hwnd()));
  panel.setBounds(0, 0, 300, 200, true, true);
  panel.doLayout();
  panel.ask.setBounds(10, 10, 80, 24, true, true);
  int boxes = 0;
  DialogDriver driver({[&](ShownDialog& d) {
                         ++boxes;
                         SetWindowTextA(d.edit, "Phare du Minou");
                         d.click("OK");
                       },
                       [&](ShownDialog& d) {
                         ++boxes;
                         d.click("CANCEL");
                       }});
  wtest::press(panel.ask.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  wtest::press(panel.ask.getHandle(), WM_LBUTTONUP, 3, 3, 0);
  CHECK(panel.answer == IDYES);
  CHECK(panel.name == "Phare du Minou");
  // Again, once the first box's parts have gone: a fresh box, and Cancel keeps the name.
  wtest::press(panel.ask.getHandle(), WM_LBUTTONDOWN, 3, 3, MK_LBUTTON);
  wtest::press(panel.ask.getHandle(), WM_LBUTTONUP, 3, 3, 0);
  CHECK(panel.answer == IDCANCEL);
  CHECK(panel.name == "Phare du Minou");
  CHECK(boxes == 2);
  CHECK(IsWindowEnabled(host.hwnd()));  // the owner has its input back
}
