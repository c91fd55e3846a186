// Tooltip popups: they follow the shared cursor of the Wine desktop, so this suite runs alone.
#include <doctest/doctest.h>

#include "tests/wine/common/widget_test_support.h"
#include "toolkit/widgets/Tooltip.h"

using namespace toolkit;
using namespace wtest;

namespace {

// A component that gives its tooltip a text when asked, and counts the asking.
class TipOwner : public cXComponent {
public:
  int asked = 0;
  bool visibleWhenAsked = true;
  const char* textToGive = "tip";
  int onNotify(ToolkitEvent& event) override {
    const auto* header = reinterpret_cast<const NMHDR*>(event.params[3]);
    if (event.source != this || !header || header->idFrom != Tooltip::kNotifyId || header->code != Tooltip::kNotifyCode)
      return 0;
    ++asked;
    visibleWhenAsked = IsWindowVisible(header->hwndFrom) != FALSE;
    Tooltip::of(*this)->setFittedText(textToGive);
    return 1;
  }
};

}  // namespace

TEST_CASE("tooltip placement at the cursor") {
  const SIZE popup{100, 40};
  CHECK(str(Tooltip::placement(POINT{200, 300}, popup, 1024, 768, 32)) == "(200,332)");  // below the cursor
  CHECK(str(Tooltip::placement(POINT{1000, 300}, popup, 1024, 768, 32)) == "(924,332)");  // kept on the screen
  CHECK(str(Tooltip::placement(POINT{10, 740}, popup, 1024, 768, 32)) == "(10,697)");  // no room below: above
}

TEST_CASE("hovering a second shows the popup of the innermost component; leaving hides it") {
  REQUIRE(cursorMoves());
  MountedPanel panel;
  const size_t before = Tooltip::count();
  TipOwner inner;
  inner.textToGive = "Depth contours";
  panel.add(&inner);
  inner.setBounds(20, 20, 100, 50, true, true);
  Tooltip* outerTip = Tooltip::of(panel);
  Tooltip* tip = Tooltip::of(inner);
  REQUIRE(tip);
  CHECK(Tooltip::count() == before + 1);  // one popup per component window
  outerTip->setFittedText("outer");

  SetCursorPos(150, 150);  // over the inner component (the host is at 100, 100)
  pump(700);
  CHECK_FALSE(IsWindowVisible(tip->window()));  // not yet: a second of hovering first
  CHECK(inner.asked == 0);
  while (!IsWindowVisible(tip->window()) && GetTickCount() - tip->armedAt() < 2000) pump(5);
  CHECK(GetTickCount() - tip->armedAt() < Tooltip::kDelayMs + 300);
  CHECK(inner.asked == 1);
  CHECK_FALSE(inner.visibleWhenAsked);  // asked first, shown after
  CHECK(tip->text() == "Depth contours");
  CHECK_FALSE(IsWindowVisible(outerTip->window()));
  pump(200);
  CHECK(inner.asked == 1);  // once per visit

  SetCursorPos(400, 250);  // over the panel only
  pump(1300);
  CHECK_FALSE(IsWindowVisible(tip->window()));
  CHECK(IsWindowVisible(outerTip->window()));
  SetCursorPos(5, 5);
  pump(100);
  CHECK_FALSE(IsWindowVisible(outerTip->window()));
  CHECK_FALSE(outerTip->isArmed());
}

TEST_CASE("shutting the popups down for unload, and starting again") {
  HostWindow host;
  HWND popup = nullptr;
  {
    TipOwner first;
    REQUIRE(first.create(host.hwnd()));
    popup = first.tooltipWindow();
    CHECK(windowClass(popup) == Tooltip::kClassName);
  }
  CHECK_FALSE(IsWindow(popup));  // destroyed with its component
  TipOwner first;
  REQUIRE(first.create(host.hwnd()));
  popup = first.tooltipWindow();
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
