#include "toolkit/core/ComponentPeer.h"

#include <windowsx.h>

#include "toolkit/access/ComponentAccessible.h"
#include "toolkit/access/make_accessible.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/core/cXComponent.h"

namespace toolkit {

namespace {

bool isPointerMessage(UINT message) {
  // Messages with the pointer over the window; the wheel goes to the focus
  // window wherever the pointer is, so it does not start a visit.
  return message >= WM_MOUSEFIRST && message <= WM_MOUSELAST && message != WM_MOUSEWHEEL &&
         message != WM_MOUSEHWHEEL;
}

}  // namespace

ComponentPeer::ComponentPeer(cXComponent& owner, int kind)
    : owner_(owner), kind_(kind), alive_(std::make_shared<bool>(true)) {}

ComponentPeer::~ComponentPeer() {
  *alive_ = false;
  silence();
  stopTracking();
  if (hwnd_ && IsWindow(hwnd_)) DestroyWindow(hwnd_);
  hwnd_ = nullptr;
  queue_.clear();
}

void ComponentPeer::queue(std::unique_ptr<ToolkitEvent> event) {
  if (event) queue_.push_back(std::move(event));
}

bool ComponentPeer::drain() {
  const std::shared_ptr<bool> alive = alive_;
  bool handled = false;
  while (!queue_.empty()) {
    std::unique_ptr<ToolkitEvent> event = std::move(queue_.front());
    queue_.pop_front();
    if (silent_) continue;
    owner_.dispatchEvent(*event);
    handled = event->handled;
    if (!*alive) break;  // a handler deleted the component: touch nothing more
  }
  return handled;
}

std::unique_ptr<ToolkitEvent> ComponentPeer::makeEvent(HWND hwnd, int id) const {
  return std::make_unique<ToolkitEvent>(&owner_, id, hwnd);
}

void ComponentPeer::windowGone(HWND hwnd) {
  if (hwnd != hwnd_) return;
  trackingTimer_ = 0;  // timers die with their window
  hwnd_ = nullptr;
  dropAccessible();
}

void ComponentPeer::silence() {
  silent_ = true;
  dropAccessible();
}

void ComponentPeer::stopTracking() {
  if (trackingTimer_ && hwnd_ && IsWindow(hwnd_)) KillTimer(hwnd_, trackingTimer_);
  trackingTimer_ = 0;
}

void ComponentPeer::trackMouse(HWND hwnd) {
  if (trackingTimer_) return;
  HWND timerWindow = hwnd_ ? hwnd_ : hwnd;
  if (!SetTimer(timerWindow, kTrackingTimer, kTrackingPeriodMs, nullptr)) return;
  trackingTimer_ = kTrackingTimer;
  POINT cursor{};
  GetCursorPos(&cursor);
  auto enter = makeEvent(hwnd, kEventMouseEnter);
  enter->params[0] = cursor.x;
  enter->params[1] = cursor.y;
  queue(std::move(enter));
}

void ComponentPeer::checkMouseLeft(HWND hwnd) {
  HWND window = hwnd_ ? hwnd_ : hwnd;
  POINT cursor{};
  GetCursorPos(&cursor);
  RECT rect{};
  GetWindowRect(window, &rect);
  if (PtInRect(&rect, cursor)) return;
  // While this component holds the capture the visit goes on (e.g. a drag).
  HWND capture = GetCapture();
  if (capture && ToolkitWindows::componentOf(capture) == &owner_) return;
  KillTimer(window, trackingTimer_);
  trackingTimer_ = 0;
  auto exit = makeEvent(hwnd, kEventMouseExit);
  exit->params[0] = cursor.x;
  exit->params[1] = cursor.y;
  queue(std::move(exit));
}

bool ComponentPeer::handleMessage(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam,
                                  LRESULT& result) {
  switch (message) {
    case WM_GETFONT: return answerFont(result);
    case WM_ENABLE: return followEnable(wParam);
    case WM_GETOBJECT: return answerObject(hwnd, wParam, lParam, result);
    default: break;
  }
  const bool ownTimerTick = translate(hwnd, message, wParam, lParam);
  const bool handled = drain();
  // The tracking timer is the toolkit's own: a native control must not see it.
  return handled || ownTimerTick;
}

bool ComponentPeer::answerFont(LRESULT& result) const {
  result = reinterpret_cast<LRESULT>(owner_.getFont());
  return true;
}

bool ComponentPeer::followEnable(WPARAM wParam) {
  // Keep the component's flag in step with the window.
  owner_.setEnabled(wParam != 0);
  return true;
}

// Only the component's own window of a self-drawn component answers: the
// platform describes native controls (and plain containers, by their child
// windows) better than the toolkit could.
bool ComponentPeer::answerObject(HWND hwnd, WPARAM wParam, LPARAM lParam, LRESULT& result) {
  if (hwnd != hwnd_ || silent_ || static_cast<DWORD>(lParam) != static_cast<DWORD>(OBJID_CLIENT)) return false;
  if (!accessible_) accessible_ = makeAccessible(owner_);
  if (!accessible_) return false;
  result = accessible_->toLresult(wParam);
  return result > 0;
}

void ComponentPeer::dropAccessible() {
  if (!accessible_) return;
  // Clients may hold it longer than the window lives: from now on it answers
  // that its component is gone.
  accessible_->disconnect();
  accessible_->Release();
  accessible_ = nullptr;
}

// Queues the events of one message. Answers true only for a tick of the
// mouse-tracking timer.
bool ComponentPeer::translate(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  if (isPointerMessage(message)) trackMouse(hwnd);
  if (message == WM_TIMER && wParam == kTrackingTimer && trackingTimer_) {
    checkMouseLeft(hwnd);
    return true;
  }
  queue(eventFor(hwnd, message, wParam, lParam));
  return false;
}

// One line per message: the handler that makes its event (null: none).
ComponentPeer::Event ComponentPeer::eventFor(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_COMMAND: return commandEvent(hwnd, wParam, lParam);
    case WM_NOTIFY:
    case WM_DRAWITEM:
    case WM_MEASUREITEM: return notifyEvent(hwnd, message, wParam, lParam);
    case WM_SETFOCUS: return makeEvent(hwnd, kEventFocusGained);
    case WM_KILLFOCUS: return makeEvent(hwnd, kEventFocusLost);
    case WM_KEYDOWN: return keyEvent(hwnd, kEventKeyDown, wParam, lParam);
    case WM_KEYUP: return keyEvent(hwnd, kEventKeyUp, wParam, lParam);
    case WM_CHAR: return keyEvent(hwnd, kEventChar, static_cast<unsigned char>(wParam), lParam);
    case WM_LBUTTONDOWN:
    case WM_RBUTTONDOWN:
    case WM_LBUTTONDBLCLK:
    case WM_RBUTTONDBLCLK: return mouseDownEvent(hwnd, message, wParam, lParam);
    case WM_MOUSEMOVE: return mouseMoveEvent(hwnd, wParam, lParam);
    case WM_LBUTTONUP:
    case WM_RBUTTONUP: return mouseUpEvent(hwnd, message, wParam, lParam);
    case WM_MOUSEWHEEL: return wheelEvent(hwnd, wParam, lParam);
    case WM_VSCROLL: return scrollEvent(hwnd, wParam, false);
    case WM_HSCROLL: return scrollEvent(hwnd, wParam, true);
    case WM_DESTROY: return destroyEvent(hwnd);
    case WM_SIZE: return sizeEvent(hwnd, wParam, lParam);
    case WM_MOVE: return makeEvent(hwnd, kEventMoved);
    case WM_CLOSE: return makeEvent(hwnd, kEventClose);
    case WM_PAINT: return makeEvent(hwnd, kEventPaint);
    case WM_ERASEBKGND: return valueEvent(hwnd, kEventEraseBackground, wParam);
    case WM_ACTIVATE: return makeEvent(hwnd, LOWORD(wParam) == WA_INACTIVE ? kEventDeactivated : kEventActivated);
    case WM_CREATE: return makeEvent(hwnd, kEventCreate);
    case WM_TIMER: return valueEvent(hwnd, kEventTimer, wParam);
    case WM_SETCURSOR: return valueEvent(hwnd, kEventSetCursor, wParam);
    default: return nullptr;
  }
}

ComponentPeer::Event ComponentPeer::valueEvent(HWND hwnd, int id, WPARAM wParam) const {
  Event e = makeEvent(hwnd, id);
  e->params[0] = static_cast<std::intptr_t>(wParam);
  return e;
}

ComponentPeer::Event ComponentPeer::commandEvent(HWND hwnd, WPARAM wParam, LPARAM lParam) const {
  Event e = makeEvent(hwnd, kEventCommand);
  e->params[0] = HIWORD(wParam);
  e->params[1] = LOWORD(wParam);
  e->params[2] = lParam;
  return e;
}

ComponentPeer::Event ComponentPeer::notifyEvent(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) const {
  Event e = makeEvent(hwnd, kEventNotify);
  e->params[0] = message == WM_NOTIFY ? 1 : message == WM_DRAWITEM ? 2 : 3;
  e->params[1] = message;
  e->params[2] = static_cast<std::intptr_t>(wParam);
  e->params[3] = lParam;
  return e;
}

ComponentPeer::Event ComponentPeer::keyEvent(HWND hwnd, int id, WPARAM key, LPARAM lParam) const {
  Event e = makeEvent(hwnd, id);
  e->params[0] = static_cast<std::intptr_t>(key);
  e->params[1] = lParam;
  return e;
}

ComponentPeer::Event ComponentPeer::mouseDownEvent(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) const {
  Event e = makeEvent(hwnd, kEventMouseDown);
  e->params[0] = GET_X_LPARAM(lParam);
  e->params[1] = GET_Y_LPARAM(lParam);
  e->params[2] = message == WM_RBUTTONDOWN || message == WM_RBUTTONDBLCLK;
  e->params[3] = static_cast<std::intptr_t>(wParam);
  e->params[4] = message == WM_LBUTTONDBLCLK || message == WM_RBUTTONDBLCLK;
  e->keyState = static_cast<int>(wParam);
  return e;
}

// A move with a button down is a drag.
ComponentPeer::Event ComponentPeer::mouseMoveEvent(HWND hwnd, WPARAM wParam, LPARAM lParam) const {
  Event e;
  if (wParam & (MK_LBUTTON | MK_RBUTTON)) {
    e = makeEvent(hwnd, kEventMouseDrag);
    e->params[2] = (wParam & MK_RBUTTON) != 0;
  } else {
    e = makeEvent(hwnd, kEventMouseMove);
    e->params[2] = static_cast<std::intptr_t>(wParam);
  }
  e->params[0] = GET_X_LPARAM(lParam);
  e->params[1] = GET_Y_LPARAM(lParam);
  e->keyState = static_cast<int>(wParam);
  return e;
}

ComponentPeer::Event ComponentPeer::mouseUpEvent(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) const {
  Event e = makeEvent(hwnd, kEventMouseUp);
  e->params[0] = GET_X_LPARAM(lParam);
  e->params[1] = GET_Y_LPARAM(lParam);
  e->params[2] = message == WM_RBUTTONUP;
  e->keyState = static_cast<int>(wParam);
  return e;
}

ComponentPeer::Event ComponentPeer::wheelEvent(HWND hwnd, WPARAM wParam, LPARAM lParam) const {
  Event e = makeEvent(hwnd, kEventMouseWheel);
  e->params[0] = GET_X_LPARAM(lParam);
  e->params[1] = GET_Y_LPARAM(lParam);
  e->params[2] = static_cast<std::intptr_t>(wParam);
  e->keyState = GET_KEYSTATE_WPARAM(wParam);
  return e;
}

// The thumb carries its position beside the direction; other scroll codes make no event.
ComponentPeer::Event ComponentPeer::scrollEvent(HWND hwnd, WPARAM wParam, bool horizontal) const {
  Event e;
  switch (LOWORD(wParam)) {
    case SB_THUMBPOSITION:
    case SB_THUMBTRACK:
      e = makeEvent(hwnd, kEventScrollThumb);
      e->params[0] = HIWORD(wParam);
      e->params[1] = horizontal;
      return e;
    case SB_LINEDOWN: e = makeEvent(hwnd, kEventScrollLineDown); break;
    case SB_LINEUP: e = makeEvent(hwnd, kEventScrollLineUp); break;
    case SB_PAGEDOWN: e = makeEvent(hwnd, kEventScrollPageDown); break;
    case SB_PAGEUP: e = makeEvent(hwnd, kEventScrollPageUp); break;
    default: return nullptr;
  }
  e->params[0] = horizontal;
  return e;
}

ComponentPeer::Event ComponentPeer::destroyEvent(HWND hwnd) {
  if (hwnd == hwnd_ || !hwnd_) stopTracking();
  return makeEvent(hwnd, kEventDestroy);
}

ComponentPeer::Event ComponentPeer::sizeEvent(HWND hwnd, WPARAM wParam, LPARAM lParam) const {
  Event e = makeEvent(hwnd, wParam == SIZE_MAXIMIZED   ? kEventMaximized
                            : wParam == SIZE_MINIMIZED ? kEventMinimized
                                                       : kEventResized);
  e->params[0] = LOWORD(lParam);
  e->params[1] = HIWORD(lParam);
  return e;
}

}  // namespace toolkit
