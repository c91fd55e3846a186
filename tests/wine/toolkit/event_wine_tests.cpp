// Messages to events, dispatch, bubbling, "consumed", the native procedure of a
// subclassed window, focus requests, posted and sent events.
#include <doctest/doctest.h>

#include <utility>
#include <vector>

#include "ToolkitTestSupport.h"
#include "toolkit/core/Panel.h"
#include "toolkit/core/ToolkitWindows.h"

using namespace toolkit;
using namespace tktest;

namespace {

// Watches what reaches the default processing.
std::vector<NativeCall> g_defaultCalls;
LRESULT CALLBACK watchingDefault(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  g_defaultCalls.push_back(NativeCall{hwnd, message, wParam});
  return DefWindowProcA(hwnd, message, wParam, lParam);
}

struct DefaultWatch {
  DefaultWatch() {
    g_defaultCalls.clear();
    previous = ToolkitWindows::setDefaultProcedure(&watchingDefault);
  }
  ~DefaultWatch() { ToolkitWindows::setDefaultProcedure(previous); }
  const NativeCall* lastOf(UINT message) const {
    for (auto it = g_defaultCalls.rbegin(); it != g_defaultCalls.rend(); ++it)
      if (it->message == message) return &*it;
    return nullptr;
  }
  WNDPROC previous;
};

// A probe whose window is the test's "native control", subclassed by the toolkit.
void createNative(Probe& probe, HWND parent) {
  REQUIRE(probe.createWindow(0, nativeClassName(), "", WS_CHILD | WS_VISIBLE, 0, 0, 50, 20, parent, 0));
}

}  // namespace

TEST_CASE("every message of the table becomes its event with its parameters") {
  HostWindow host;
  Probe p;
  REQUIRE(p.create(host.hwnd()));
  CHECK(p.last(kEventCreate));  // WM_CREATE reaches the component being created
  HWND h = p.getHandle();
  auto send = [&](UINT m, WPARAM w, LPARAM l) {
    p.seen.clear();
    return SendMessageA(h, m, w, l);
  };
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
      {WM_HSCROLL, SB_LINEDOWN, 0, kEventScrollLineDown, {{0, 1}}},
      {WM_SIZE, SIZE_MAXIMIZED, MAKELPARAM(640, 480), kEventMaximized, {{0, 640}, {1, 480}}},
      {WM_SIZE, SIZE_MINIMIZED, 0, kEventMinimized, {}},
      {WM_SIZE, SIZE_RESTORED, MAKELPARAM(5, 6), kEventResized, {{1, 6}}},
      {WM_ACTIVATE, WA_CLICKACTIVE, 0, kEventActivated, {}},
      {WM_ACTIVATE, WA_INACTIVE, 0, kEventDeactivated, {}},
      {WM_SETCURSOR, static_cast<WPARAM>(hAt), MAKELPARAM(HTCLIENT, WM_MOUSEMOVE), kEventSetCursor, {{0, hAt}}},
  };
  for (const Row& row : rows) {
    CAPTURE(row.m);
    send(row.m, row.w, row.l);
    const Seen* s = p.last(row.id);
    REQUIRE(s);
    CHECK(s->source == &p);
    CHECK(s->hwnd == h);
    for (const auto& [index, value] : row.params) CHECK(s->params[index] == value);
  }
  send(WM_RBUTTONDBLCLK, MK_RBUTTON, MAKELPARAM(7, 9));
  CHECK(p.last(kEventMouseDown)->keyState == MK_RBUTTON);
  send(WM_MOUSEMOVE, MK_LBUTTON, 0);  // a drag is no move, a move no drag
  CHECK_FALSE(p.last(kEventMouseMove));
  send(WM_MOUSEMOVE, 0, 0);
  CHECK_FALSE(p.last(kEventMouseDrag));
  for (UINT m : {UINT(WM_VSCROLL), UINT(WM_NCHITTEST)}) {  // SB_ENDSCROLL and others: no event
    send(m, SB_ENDSCROLL, 0);
    CHECK(p.seen.empty());
  }

  // WM_ENABLE (sent by the platform, not by setEnabled) keeps the component's flag in step.
  EnableWindow(h, FALSE);
  CHECK_FALSE(p.getEnabledFlag());
  EnableWindow(h, TRUE);
  CHECK(p.getEnabledFlag());

  // WM_CLOSE reaches the default processing, which destroys the window.
  send(WM_CLOSE, 0, 0);
  CHECK(p.last(kEventClose));
  CHECK(p.last(kEventDestroy));
  CHECK_FALSE(IsWindow(h));
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
  leaf.destroyWindow();
  createNative(leaf, middle->getHandle());

  auto only = [](const std::vector<Seen>& seen, int id) {
    std::vector<Seen> out;
    for (const Seen& s : seen)
      if (s.id == id) out.push_back(s);
    return out;
  };
  leaf.requestFocus();  // so that the key brings no focus events along
  middle->seen.clear();
  root.seen.clear();
  nativeCalls().clear();
  SendMessageA(leaf.getHandle(), WM_KEYDOWN, 'Q', 0);
  REQUIRE(leaf.last(kEventKeyDown));
  auto atMiddle = only(middle->seen, kEventKeyDown);
  REQUIRE(atMiddle.size() == 1);
  CHECK(atMiddle[0].source == &leaf);
  auto atRoot = only(root.seen, kEventKeyDown);
  REQUIRE(atRoot.size() == 1);
  CHECK(atRoot[0].source == &leaf);
  CHECK(atRoot[0].params[0] == 'Q');
  REQUIRE(nativeCount(WM_KEYDOWN) == 1);
  CHECK(nativeCalls().back().wParam == 'Q');

  // An answer ends the bubbling but does not consume the message.
  middle->answer = 1;
  root.seen.clear();
  nativeCalls().clear();
  SendMessageA(leaf.getHandle(), WM_KEYDOWN, 'R', 0);
  CHECK(only(root.seen, kEventKeyDown).empty());
  CHECK(nativeCount(WM_KEYDOWN) == 1);

  middle->removeComponent(&leaf, false);
  root.removeComponent(middle, true);
}

TEST_CASE("a handled WM_KEYDOWN reaches the default processing with key 0, never the native procedure") {
  HostWindow host;
  Probe p;
  createNative(p, host.hwnd());
  DefaultWatch watch;
  nativeCalls().clear();

  p.markHandled = true;
  p.answer = 1;
  SendMessageA(p.getHandle(), WM_KEYDOWN, 'A', 0x1E0001);
  CHECK(nativeCount(WM_KEYDOWN) == 0);
  REQUIRE(watch.lastOf(WM_KEYDOWN));
  CHECK(watch.lastOf(WM_KEYDOWN)->wParam == 0);
  SendMessageA(p.getHandle(), WM_CHAR, 'a', 0);
  CHECK(nativeCount(WM_CHAR) == 0);
  CHECK(watch.lastOf(WM_CHAR)->wParam == 0);

  // Unmarked keys go on unchanged: the bubbling case. Consumed notifications answer 1.
  NMHDR nm{p.getHandle(), 1, 0};
  CHECK(SendMessageA(p.getHandle(), WM_NOTIFY, 1, reinterpret_cast<LPARAM>(&nm)) == 1);
  CHECK(nativeCount(WM_NOTIFY) == 0);
}

TEST_CASE("a subclassed window gets its procedure back and sees WM_NCDESTROY") {
  HostWindow host;
  Probe p;
  createNative(p, host.hwnd());
  HWND h = p.getHandle();  // subclassed: the bubbling case sees its messages as events
  CHECK(wtest::windowClass(h) == nativeClassName());
  nativeCalls().clear();
  const size_t before = ToolkitWindows::windowCount();
  DestroyWindow(h);
  CHECK(nativeCount(WM_NCDESTROY) == 1);
  CHECK(ToolkitWindows::windowCount() == before - 1);
  CHECK_FALSE(p.isValid());
}

TEST_CASE("key, character and mouse-down handlers get the focus first; Tab moves it on") {
  HostWindow host;
  Panel root;
  REQUIRE(root.create(host.hwnd()));
  Probe a, b;
  root.add(&a);
  root.add(&b);
  SetFocus(host.hwnd());
  REQUIRE(GetFocus() == host.hwnd());

  SendMessageA(a.getHandle(), WM_LBUTTONDOWN, MK_LBUTTON, 0);
  CHECK(GetFocus() == a.getHandle());
  SetFocus(host.hwnd());
  SendMessageA(b.getHandle(), WM_CHAR, 'x', 0);
  CHECK(GetFocus() == b.getHandle());
  // Other events do not move the focus.
  SendMessageA(a.getHandle(), WM_MOUSEMOVE, 0, 0);
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

TEST_CASE("posted events wait for the message loop; sent events are dispatched at once") {
  HostWindow host;
  Probe p;
  REQUIRE(p.create(host.hwnd()));
  p.seen.clear();
  auto posted = std::make_unique<ToolkitEvent>(&p, 40, p.getHandle());
  posted->params[0] = 99;
  REQUIRE(p.postEvent(std::move(posted)));
  CHECK(p.seen.empty());
  CHECK(p.peer()->queuedEvents() == 1);
  pump(20);
  REQUIRE(p.last(40));
  CHECK(p.last(40)->params[0] == 99);
  CHECK(p.peer()->queuedEvents() == 0);

  p.seen.clear();
  REQUIRE(p.sendEvent(std::make_unique<ToolkitEvent>(&p, 41, p.getHandle())));
  CHECK(p.last(41));

  // Events queued together are dispatched in order.
  p.seen.clear();
  p.peer()->queue(std::make_unique<ToolkitEvent>(&p, 50, p.getHandle()));
  p.peer()->queue(std::make_unique<ToolkitEvent>(&p, 51, p.getHandle()));
  SendMessageA(p.getHandle(), WM_MOVE, 0, 0);
  CHECK(p.ids() == std::vector<int>{50, 51, kEventMoved});
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

TEST_CASE("onPaint paints only the component's own window and claims nothing") {
  HostWindow host;
  struct Painter : Probe {
    int painted = 0;
    void paint(HDC) override { ++painted; }
  } p;
  REQUIRE(p.create(host.hwnd()));
  p.setBounds(0, 0, 40, 40, true, true);
  UpdateWindow(p.getHandle());
  p.painted = 0;
  InvalidateRect(p.getHandle(), nullptr, FALSE);
  UpdateWindow(p.getHandle());
  CHECK(p.painted == 1);
  RECT update{};
  CHECK_FALSE(GetUpdateRect(p.getHandle(), &update, FALSE));

  // With redraw off, nothing is painted (and nothing is invalidated).
  p.setRedraw(false);
  SendMessageA(p.getHandle(), WM_PAINT, 0, 0);
  CHECK(p.painted == 1);
  p.setRedraw(true);
}
