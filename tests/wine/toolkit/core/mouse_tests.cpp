// Mouse enter and exit through the tracking timer (0xF000, 20 ms).
#include <doctest/doctest.h>

#include <algorithm>

#include "tests/wine/common/toolkit_test_support.h"
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

}  // namespace

TEST_CASE("entering yields event 10 before the first 12; leaving yields 11 within about 20 ms") {
  // A 100 x 100 probe in the corner of the host (at (100, 100) on the screen), the cursor over it.
  REQUIRE(wtest::cursorMoves());
  HostWindow host;
  Probe p;
  REQUIRE(p.create(host.hwnd()));
  p.setBounds(0, 0, 100, 100, true, true);
  p.seen.clear();
  SetCursorPos(150, 150);
  SendMessageA(p.getHandle(), WM_MOUSEMOVE, 0, MAKELPARAM(50, 50));
  std::vector<int> ids = p.ids();
  CHECK(ids == std::vector<int>{kEventMouseEnter, kEventMouseMove});
  CHECK((p.last(kEventMouseEnter)->params[0] == 150 && p.last(kEventMouseEnter)->params[1] == 150));
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
  CHECK(took <= 120);  // one 20 ms tick, with room for a loaded machine
  CHECK(p.last(kEventMouseExit)->params[0] == 400);
  CHECK(p.peer()->trackingTimer() == 0);
}

