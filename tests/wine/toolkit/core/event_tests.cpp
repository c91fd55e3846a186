// Messages to events, bubbling, the subclassed native procedure, focus, deletion in a handler.
#include <doctest/doctest.h>

#include <memory>
#include <utility>
#include <vector>

#include "tests/wine/common/toolkit_test_support.h"
#include "toolkit/core/Panel.h"
#include "toolkit/core/ToolkitWindows.h"

using namespace toolkit;
using namespace tktest;

TEST_CASE("every message of the table becomes its event with its parameters") {
  HostWindow host;
  Probe p;
  REQUIRE(p.create(host.hwnd()));
  CHECK(p.last(kEventCreate));  // WM_CREATE reaches the component being created
  HWND h = p.getHandle();
  NMHDR nm{h, 7, 0};
  const LPARAM nmAt = reinterpret_cast<LPARAM>(&nm);
  const auto hAt = reinterpret_cast<std::intptr_t>(h);
  // message, wParam, lParam, then the event and (index, value) pairs of its parameters.
  using P = std::vector<std::pair<int, std::intptr_t>>;
  struct Row { UINT m; WPARAM w; LPARAM l; int id; P params; };
  const Row rows[] = {
      {WM_COMMAND, MAKEWPARAM(1001, 5), 0x1234, kEventCommand, {{0, 5}, {1, 1001}, {2, 0x1234}}},
      {WM_NOTIFY, 7, nmAt, kEventNotify, {{0, 1}, {1, WM_NOTIFY}, {3, nmAt}}},  // a full-width pointer
      {WM_CHAR, 0x1B0, 0, kEventChar, {{0, 0xB0}}},  // one byte of the character
      {WM_RBUTTONDBLCLK, MK_RBUTTON, MAKELPARAM(7, 9), kEventMouseDown, {{0, 7}, {1, 9}, {2, 1}, {3, MK_RBUTTON}, {4, 1}}},
      {WM_MOUSEMOVE, MK_LBUTTON, MAKELPARAM(11, 12), kEventMouseDrag, {}},
      {WM_VSCROLL, MAKEWPARAM(SB_THUMBTRACK, 33), 0, kEventScrollThumb, {{0, 33}, {1, 0}}},
      {WM_SIZE, SIZE_MAXIMIZED, MAKELPARAM(640, 480), kEventMaximized, {{0, 640}, {1, 480}}},
      {WM_SIZE, SIZE_MINIMIZED, 0, kEventMinimized, {}},
      {WM_SIZE, SIZE_RESTORED, MAKELPARAM(5, 6), kEventResized, {{1, 6}}},
      {WM_ACTIVATE, WA_CLICKACTIVE, 0, kEventActivated, {}},
      {WM_ACTIVATE, WA_INACTIVE, 0, kEventDeactivated, {}},
      {WM_SETCURSOR, static_cast<WPARAM>(hAt), MAKELPARAM(HTCLIENT, WM_MOUSEMOVE), kEventSetCursor, {{0, hAt}}},
  };
  for (const Row& row : rows) {
    CAPTURE(row.m);
    p.seen.clear();
    SendMessageA(h, row.m, row.w, row.l);
    const Seen* s = p.last(row.id);
    REQUIRE(s);
    CHECK((s->source == &p && s->hwnd == h));
    for (const auto& [index, value] : row.params) CHECK(s->params[index] == value);
  }
}

TEST_CASE("an unanswered event bubbles to the root, then the message goes to the native procedure") {
  HostWindow host;
  ProbePanel root;
  REQUIRE(root.create(host.hwnd()));
  auto* middle = new ProbePanel;
  root.add(middle, "middle");
  Probe leaf;
  middle->add(&leaf);  // created by the container: it has a window
  REQUIRE(middle->isValid());
  REQUIRE(leaf.isValid());
  leaf.destroyWindow();  // remade as the test's "native control", subclassed by the toolkit
  REQUIRE(leaf.createWindow(0, nativeClassName(), "", WS_CHILD | WS_VISIBLE, 0, 0, 50, 20, middle->getHandle(), 0));

  auto keyDowns = [](const std::vector<Seen>& seen) {
    int n = 0;
    for (const Seen& s : seen) n += s.id == kEventKeyDown;
    return n;
  };
  leaf.requestFocus();  // so that the key brings no focus events along
  root.seen.clear();
  nativeCalls().clear();
  SendMessageA(leaf.getHandle(), WM_KEYDOWN, 'Q', 0);
  REQUIRE(keyDowns(root.seen) == 1);
  const Seen* atRoot = wtest::lastOf(root.seen, kEventKeyDown);
  CHECK((atRoot->source == &leaf && atRoot->params[0] == 'Q'));
  REQUIRE(nativeCount(WM_KEYDOWN) == 1);
  CHECK(nativeCalls().back().wParam == 'Q');

  // An answer ends the bubbling but does not consume the message.
  middle->answer = 1;
  root.seen.clear();
  nativeCalls().clear();
  SendMessageA(leaf.getHandle(), WM_KEYDOWN, 'R', 0);
  CHECK(keyDowns(root.seen) == 0);
  CHECK(nativeCount(WM_KEYDOWN) == 1);

  middle->removeComponent(&leaf, false);
  root.removeComponent(middle, true);
}

TEST_CASE("key and mouse-down handlers get the focus first; Tab moves it on") {
  HostWindow host;
  Panel root;
  REQUIRE(root.create(host.hwnd()));
  Probe a, b;
  root.add(&a);
  root.add(&b);
  SetFocus(host.hwnd());
  REQUIRE(GetFocus() == host.hwnd());

  SendMessageA(b.getHandle(), WM_LBUTTONDOWN, MK_LBUTTON, 0);
  CHECK(GetFocus() == b.getHandle());
  // Tab goes from b around to a; the event is answered there.
  SendMessageA(b.getHandle(), WM_KEYDOWN, VK_TAB, 0);
  CHECK(GetFocus() == a.getHandle());
  CHECK(b.last(kEventKeyDown)->params[0] == VK_TAB);
  // A container asked for the focus keeps it on a child that has it.
  root.requestFocus();
  CHECK(GetFocus() == a.getHandle());
  root.removeComponent(&a, false);
  root.removeComponent(&b, false);
}

TEST_CASE("a handler that deletes its own component ends the dispatch safely") {
  HostWindow host;
  int deletions = 0;
  auto* p = new Probe;
  p->deletions = &deletions;
  REQUIRE(p->create(host.hwnd()));
  HWND h = p->getHandle();
  p->deleteSelfOnKey = true;
  SendMessageA(h, WM_KEYDOWN, 'D', 0);
  CHECK(deletions == 1);
  CHECK_FALSE(IsWindow(h));
  CHECK(ToolkitWindows::componentOf(h) == nullptr);
}


// Regressions: WM_ENABLE passes the platform's flag on; a posted event reaches the component
// through the message loop; a subclassed window has its own procedure back for WM_NCDESTROY.
TEST_CASE("platform enabling, posted events and the end of a subclassed window") {
  HostWindow host;
  Probe p;
  REQUIRE(p.createWindow(0, nativeClassName(), "", WS_CHILD | WS_VISIBLE, 0, 0, 50, 20, host.hwnd(), 0));
  HWND h = p.getHandle();
  EnableWindow(h, FALSE);
  CHECK_FALSE(p.getEnabledFlag());
  EnableWindow(h, TRUE);
  CHECK(p.getEnabledFlag());

  p.seen.clear();
  auto posted = std::make_unique<ToolkitEvent>(&p, 40, h);
  posted->params[0] = 99;
  REQUIRE(p.postEvent(std::move(posted)));
  CHECK(p.seen.empty());
  pump(20);
  REQUIRE(p.last(40));
  CHECK(p.last(40)->params[0] == 99);

  nativeCalls().clear();
  const size_t before = ToolkitWindows::windowCount();
  DestroyWindow(h);
  CHECK(nativeCount(WM_NCDESTROY) == 1);
  CHECK(ToolkitWindows::windowCount() == before - 1);
  CHECK_FALSE(p.isValid());
}
