// Tooltip popups (they follow the shared cursor of the Wine desktop) and the
// clipboard (shared by every process of the prefix): this suite runs alone.
#include <doctest/doctest.h>

#include "WidgetTestSupport.h"
#include "toolkit/widgets/Tooltip.h"
#include "toolkit/widgets/cXEdit2.h"

using namespace toolkit;
using namespace wtest;

namespace {

// A component that records the tooltip notifications it gets.
class TipOwner : public cXComponent {
public:
  int asked = 0;
  HWND askedBy = nullptr;
  bool visibleWhenAsked = true;
  const char* textToGive = nullptr;
  int onNotify(ToolkitEvent& event) override {
    const auto* header = reinterpret_cast<const NMHDR*>(event.params[3]);
    if (event.source == this && header && header->idFrom == Tooltip::kNotifyId && header->code == Tooltip::kNotifyCode) {
      ++asked;
      askedBy = header->hwndFrom;
      visibleWhenAsked = IsWindowVisible(header->hwndFrom) != FALSE;
      if (textToGive) Tooltip::of(*this)->setFittedText(textToGive);
      return 1;
    }
    return 0;
  }
};

std::string clipboardText() {
  std::string text;
  if (!OpenClipboard(nullptr)) return text;
  if (HANDLE data = GetClipboardData(CF_TEXT)) {
    text = static_cast<const char*>(GlobalLock(data));
    GlobalUnlock(data);
  }
  CloseClipboard();
  return text;
}

void setClipboardText(const char* text) {
  REQUIRE(OpenClipboard(nullptr));
  EmptyClipboard();
  HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE, strlen(text) + 1);
  memcpy(GlobalLock(block), text, strlen(text) + 1);
  GlobalUnlock(block);
  SetClipboardData(CF_TEXT, block);
  CloseClipboard();
}

}  // namespace

TEST_CASE("every component window gets a hidden popup of the tooltip class, drawn in the info colours") {
  HostWindow host;
  const size_t before = Tooltip::count();
  HWND popup = nullptr;
  {
    TipOwner owner;
    REQUIRE(owner.create(host.hwnd()));
    popup = owner.tooltipWindow();
    REQUIRE(popup);
    CHECK(windowClass(popup) == Tooltip::kClassName);
    CHECK_FALSE(IsWindowVisible(popup));
    CHECK(Tooltip::count() == before + 1);
    Tooltip* tip = Tooltip::of(owner);
    REQUIRE(tip);
    CHECK(tip->owner() == owner.getHandle());
    CHECK(tip->window() == popup);

    // The frame and the text in the info text colour over the info background.
    tip->setFittedText("Wreck");
    const SIZE size = tip->size();
    const int in = Tooltip::kTextInset;
    REQUIRE(size.cx > 2 * in);
    Canvas canvas(size.cx, size.cy, RGB(255, 0, 255));
    tip->draw(canvas.dc(), RECT{0, 0, size.cx, size.cy});
    CHECK(canvas.at(0, 0) == GetSysColor(COLOR_INFOTEXT));
    CHECK(canvas.at(1, 1) == GetSysColor(COLOR_INFOBK));
    CHECK(canvas.countIn(GetSysColor(COLOR_INFOTEXT), RECT{in, in, size.cx - in, size.cy - in}) > 0);
  }
  CHECK_FALSE(IsWindow(popup));  // destroyed with its component
  CHECK(Tooltip::count() == before);
}

TEST_CASE("tooltip placement at the cursor") {
  const SIZE popup{100, 40};
  CHECK(str(Tooltip::placement(POINT{200, 300}, popup, 1024, 768, 32)) == "(200,332)");  // below the cursor
  CHECK(str(Tooltip::placement(POINT{1000, 300}, popup, 1024, 768, 32)) == "(924,332)");  // kept on the screen
  CHECK(str(Tooltip::placement(POINT{10, 740}, popup, 1024, 768, 32)) == "(10,697)");  // no room below: above
}

TEST_CASE("hovering a second shows the popup; leaving hides it") {
  REQUIRE(cursorMoves());
  HostWindow host;
  TipOwner owner;
  owner.textToGive = "Depth contours";
  REQUIRE(owner.create(host.hwnd()));
  owner.setBounds(20, 20, 100, 50, true, true);
  Tooltip* tip = Tooltip::of(owner);
  REQUIRE(tip);

  SetCursorPos(150, 150);  // inside the owner (the host is at 100, 100)
  const DWORD start = GetTickCount();
  while (!tip->isArmed() && GetTickCount() - start < 500) pump(5);
  REQUIRE(tip->isArmed());
  CHECK(GetTickCount() - start < 200);  // found by the 50 ms scan

  pump(700);
  CHECK_FALSE(IsWindowVisible(tip->window()));  // not yet: a second of hovering first
  CHECK(owner.asked == 0);
  while (!IsWindowVisible(tip->window()) && GetTickCount() - tip->armedAt() < 2000) pump(5);
  const DWORD shownAfter = GetTickCount() - tip->armedAt();
  REQUIRE(IsWindowVisible(tip->window()));
  CHECK(shownAfter > Tooltip::kDelayMs);
  CHECK(shownAfter < Tooltip::kDelayMs + 300);
  CHECK(owner.asked == 1);
  CHECK(owner.askedBy == tip->window());
  CHECK_FALSE(owner.visibleWhenAsked);  // asked first, shown after
  CHECK(tip->text() == "Depth contours");

  RECT r{};
  GetWindowRect(tip->window(), &r);
  const POINT expected = Tooltip::placement(POINT{150, 150}, tip->size(), GetSystemMetrics(SM_CXSCREEN),
                                            GetSystemMetrics(SM_CYSCREEN), GetSystemMetrics(SM_CYCURSOR));
  CHECK(str(r) == str(xywh(expected.x, expected.y, tip->size().cx, tip->size().cy)));

  pump(200);
  CHECK(owner.asked == 1);  // once per visit

  SetCursorPos(5, 5);
  pump(100);
  CHECK_FALSE(IsWindowVisible(tip->window()));
  CHECK_FALSE(tip->isArmed());
  CHECK_FALSE(tip->isShown());
}

TEST_CASE("nested components: the innermost one under the cursor gets the popup") {
  REQUIRE(cursorMoves());
  MountedPanel panel;
  TipOwner inner;
  inner.textToGive = "inner";
  panel.add(&inner);
  inner.setBounds(20, 20, 100, 50, true, true);
  Tooltip* outerTip = Tooltip::of(panel);
  Tooltip* innerTip = Tooltip::of(inner);
  REQUIRE(outerTip);
  REQUIRE(innerTip);
  outerTip->setFittedText("outer");

  SetCursorPos(150, 150);  // over the inner component
  pump(1300);
  CHECK(IsWindowVisible(innerTip->window()));
  CHECK_FALSE(IsWindowVisible(outerTip->window()));
  CHECK_FALSE(outerTip->isArmed());

  SetCursorPos(400, 350);  // over the panel only
  pump(1300);
  CHECK_FALSE(IsWindowVisible(innerTip->window()));
  CHECK(IsWindowVisible(outerTip->window()));
  SetCursorPos(5, 5);
  pump(100);
  CHECK_FALSE(IsWindowVisible(outerTip->window()));
}

TEST_CASE("edit clipboard keys move plain ANSI text (the per-type rules are the native edit suite's)") {
  MountedPanel panel;
  cXEdit2 edit;
  panel.add(&edit);
  edit.setBounds(0, 0, 200, 24, true, true);
  HWND h = edit.getHandle();

  edit.setText("north 12\xB0");
  edit.setCaret(0, 5);
  setModifiers(false, true);
  key(h, 'C');
  setModifiers(false, false);
  CHECK(clipboardText() == "north");

  edit.setCaret(6, 3);
  setModifiers(true, false);
  key(h, VK_DELETE);  // Shift+Delete cuts
  setModifiers(false, false);
  CHECK(clipboardText() == "12\xB0");
  CHECK(edit.getText() == "north ");

  setClipboardText("x\ty~z");
  setModifiers(true, false);
  key(h, VK_INSERT);  // Shift+Insert pastes what text may hold
  setModifiers(false, false);
  CHECK(edit.getText() == "north xy~z");
}

TEST_CASE("shutting the popups down for unload, and starting again") {
  HostWindow host;
  TipOwner first;
  REQUIRE(first.create(host.hwnd()));
  HWND popup = first.tooltipWindow();
  REQUIRE(IsWindow(popup));
  Tooltip::shutdown();
  CHECK_FALSE(IsWindow(popup));
  CHECK(Tooltip::count() == 0);
  WNDCLASSEXA info{};
  info.cbSize = sizeof(info);
  CHECK_FALSE(GetClassInfoExA(GetModuleHandleA(nullptr), Tooltip::kClassName, &info));

  TipOwner second;
  REQUIRE(second.create(host.hwnd()));
  CHECK(IsWindow(second.tooltipWindow()));
  CHECK(Tooltip::count() == 1);
}
