// Mouse enter and exit through the tracking timer (0xF000, 20 ms).
#include <doctest/doctest.h>

#include <algorithm>

#include "ToolkitTestSupport.h"
#include "toolkit/core/ComponentPeer.h"

using namespace toolkit;
using namespace tktest;

namespace {

// Pumps until an event of `id` reached the probe, at most `limitMs`; answers the
// milliseconds it took, or -1.
int waitFor(Probe& p, int id, int limitMs) {
  const DWORD start = GetTickCount();
  while (static_cast<int>(GetTickCount() - start) <= limitMs) {
    if (p.last(id)) return static_cast<int>(GetTickCount() - start);
    pump(1);
  }
  return p.last(id) ? static_cast<int>(GetTickCount() - start) : -1;
}

// A 100 x 100 probe in the host's corner (the host is at (100, 100) on the screen) and the
// cursor at (150, 150) over it, before any mouse message.
struct Hovered {
  HostWindow host;
  Probe p;
  Hovered() {
    REQUIRE(wtest::cursorMoves());
    REQUIRE(p.create(host.hwnd()));
    p.setBounds(0, 0, 100, 100, true, true);
    p.seen.clear();
    SetCursorPos(150, 150);
  }
};

}  // namespace

TEST_CASE("entering yields event 10 before the first 12; leaving yields 11 within about 20 ms") {
  Hovered h;
  Probe& p = h.p;
  SendMessageA(p.getHandle(), WM_MOUSEMOVE, 0, MAKELPARAM(50, 50));
  std::vector<int> ids = p.ids();
  REQUIRE(ids.size() == 2);
  CHECK(ids[0] == kEventMouseEnter);
  CHECK(ids[1] == kEventMouseMove);
  CHECK(p.last(kEventMouseEnter)->params[0] == 150);
  CHECK(p.last(kEventMouseEnter)->params[1] == 150);
  CHECK(p.peer()->trackingTimer() == ComponentPeer::kTrackingTimer);

  // Still inside: further moves make no second enter, ticks make no event.
  SendMessageA(p.getHandle(), WM_MOUSEMOVE, 0, MAKELPARAM(51, 50));
  pump(60);
  ids = p.ids();
  CHECK(std::count(ids.begin(), ids.end(), kEventMouseEnter) == 1);
  CHECK(std::count(ids.begin(), ids.end(), kEventMouseExit) == 0);
  CHECK(std::count(ids.begin(), ids.end(), kEventTimer) == 0);  // the tracking timer is no timer event

  SetCursorPos(400, 400);
  const int took = waitFor(p, kEventMouseExit, 500);
  REQUIRE(took >= 0);
  MESSAGE("exit event " << took << " ms after the cursor left");
  CHECK(took <= 120);  // one 20 ms tick, with room for a loaded machine
  CHECK(p.last(kEventMouseExit)->params[0] == 400);
  CHECK(p.peer()->trackingTimer() == 0);

  // The next visit starts again with an enter.
  p.seen.clear();
  SetCursorPos(120, 120);
  SendMessageA(p.getHandle(), WM_LBUTTONDOWN, MK_LBUTTON, MAKELPARAM(20, 20));
  ids = p.ids();
  REQUIRE(ids.size() >= 2);
  CHECK(ids[0] == kEventMouseEnter);
  CHECK(ids[1] == kEventMouseDown);
  SetCursorPos(400, 400);
  CHECK(waitFor(p, kEventMouseExit, 500) >= 0);
}

TEST_CASE("no exit while the window holds the mouse capture") {
  Hovered h;
  Probe& p = h.p;
  SendMessageA(p.getHandle(), WM_MOUSEMOVE, 0, MAKELPARAM(50, 50));
  REQUIRE(p.last(kEventMouseEnter));

  p.captureMouse();
  REQUIRE(GetCapture() == p.getHandle());
  SetCursorPos(450, 450);
  pump(120);
  CHECK_FALSE(p.last(kEventMouseExit));
  CHECK(p.peer()->trackingTimer() != 0);

  ReleaseCapture();
  CHECK(waitFor(p, kEventMouseExit, 500) >= 0);
}

TEST_CASE("destroying the window ends the tracking") {
  Hovered h;
  Probe& p = h.p;
  SendMessageA(p.getHandle(), WM_MOUSEMOVE, 0, 0);
  REQUIRE(p.peer()->trackingTimer() != 0);
  p.destroyWindow();
  CHECK(p.peer()->trackingTimer() == 0);
  pump(50);
  CHECK_FALSE(p.last(kEventMouseExit));
}
