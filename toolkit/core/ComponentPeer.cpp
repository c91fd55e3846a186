#include "toolkit/core/ComponentPeer.h"

#include <windowsx.h>

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
  silent_ = true;
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
    case WM_GETFONT:
      result = reinterpret_cast<LRESULT>(owner_.getFont());
      return true;
    case WM_ENABLE:
      // Keep the component's flag in step with the window.
      owner_.setEnabled(wParam != 0);
      return true;
    default:
      break;
  }
  const bool ownTimerTick = translate(hwnd, message, wParam, lParam);
  const bool handled = drain();
  // The tracking timer is the toolkit's own: a native control must not see it.
  return handled || ownTimerTick;
}

// Queues the events of one message. Answers true only for a tick of the
// mouse-tracking timer.
bool ComponentPeer::translate(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) {
  if (isPointerMessage(message)) trackMouse(hwnd);

  const int x = GET_X_LPARAM(lParam), y = GET_Y_LPARAM(lParam);
  std::unique_ptr<ToolkitEvent> e;
  switch (message) {
    case WM_COMMAND:
      e = makeEvent(hwnd, kEventCommand);
      e->params[0] = HIWORD(wParam);
      e->params[1] = LOWORD(wParam);
      e->params[2] = lParam;
      break;
    case WM_NOTIFY:
    case WM_DRAWITEM:
    case WM_MEASUREITEM:
      e = makeEvent(hwnd, kEventNotify);
      e->params[0] = message == WM_NOTIFY ? 1 : message == WM_DRAWITEM ? 2 : 3;
      e->params[1] = message;
      e->params[2] = static_cast<std::intptr_t>(wParam);
      e->params[3] = lParam;
      break;
    case WM_SETFOCUS: e = makeEvent(hwnd, kEventFocusGained); break;
    case WM_KILLFOCUS: e = makeEvent(hwnd, kEventFocusLost); break;
    case WM_KEYDOWN:
    case WM_KEYUP:
      e = makeEvent(hwnd, message == WM_KEYDOWN ? kEventKeyDown : kEventKeyUp);
      e->params[0] = static_cast<std::intptr_t>(wParam);
      e->params[1] = lParam;
      break;
    case WM_CHAR:
      e = makeEvent(hwnd, kEventChar);
      e->params[0] = static_cast<unsigned char>(wParam);
      e->params[1] = lParam;
      break;
    case WM_LBUTTONDOWN:
    case WM_RBUTTONDOWN:
    case WM_LBUTTONDBLCLK:
    case WM_RBUTTONDBLCLK:
      e = makeEvent(hwnd, kEventMouseDown);
      e->params[0] = x;
      e->params[1] = y;
      e->params[2] = message == WM_RBUTTONDOWN || message == WM_RBUTTONDBLCLK;
      e->params[3] = static_cast<std::intptr_t>(wParam);
      e->params[4] = message == WM_LBUTTONDBLCLK || message == WM_RBUTTONDBLCLK;
      e->keyState = static_cast<int>(wParam);
      break;
    case WM_MOUSEMOVE:
      if (wParam & (MK_LBUTTON | MK_RBUTTON)) {
        e = makeEvent(hwnd, kEventMouseDrag);
        e->params[2] = (wParam & MK_RBUTTON) != 0;
      } else {
        e = makeEvent(hwnd, kEventMouseMove);
        e->params[2] = static_cast<std::intptr_t>(wParam);
      }
      e->params[0] = x;
      e->params[1] = y;
      e->keyState = static_cast<int>(wParam);
      break;
    case WM_LBUTTONUP:
    case WM_RBUTTONUP:
      e = makeEvent(hwnd, kEventMouseUp);
      e->params[0] = x;
      e->params[1] = y;
      e->params[2] = message == WM_RBUTTONUP;
      e->keyState = static_cast<int>(wParam);
      break;
    case WM_MOUSEWHEEL:
      e = makeEvent(hwnd, kEventMouseWheel);
      e->params[0] = x;
      e->params[1] = y;
      e->params[2] = static_cast<std::intptr_t>(wParam);
      e->keyState = GET_KEYSTATE_WPARAM(wParam);
      break;
    case WM_VSCROLL:
    case WM_HSCROLL: {
      const std::intptr_t horizontal = message == WM_HSCROLL;
      switch (LOWORD(wParam)) {
        case SB_THUMBPOSITION:
        case SB_THUMBTRACK:
          e = makeEvent(hwnd, kEventScrollThumb);
          e->params[0] = HIWORD(wParam);
          e->params[1] = horizontal;
          break;
        case SB_LINEDOWN: e = makeEvent(hwnd, kEventScrollLineDown); break;
        case SB_LINEUP: e = makeEvent(hwnd, kEventScrollLineUp); break;
        case SB_PAGEDOWN: e = makeEvent(hwnd, kEventScrollPageDown); break;
        case SB_PAGEUP: e = makeEvent(hwnd, kEventScrollPageUp); break;
        default: break;  // other scroll codes make no event
      }
      if (e && e->id != kEventScrollThumb) e->params[0] = horizontal;
      break;
    }
    case WM_DESTROY:
      if (hwnd == hwnd_ || !hwnd_) stopTracking();
      e = makeEvent(hwnd, kEventDestroy);
      break;
    case WM_SIZE:
      e = makeEvent(hwnd, wParam == SIZE_MAXIMIZED   ? kEventMaximized
                          : wParam == SIZE_MINIMIZED ? kEventMinimized
                                                     : kEventResized);
      e->params[0] = LOWORD(lParam);
      e->params[1] = HIWORD(lParam);
      break;
    case WM_MOVE: e = makeEvent(hwnd, kEventMoved); break;
    case WM_CLOSE: e = makeEvent(hwnd, kEventClose); break;
    case WM_PAINT: e = makeEvent(hwnd, kEventPaint); break;
    case WM_ERASEBKGND:
      e = makeEvent(hwnd, kEventEraseBackground);
      e->params[0] = static_cast<std::intptr_t>(wParam);
      break;
    case WM_ACTIVATE:
      if (LOWORD(wParam) == WA_INACTIVE) e = makeEvent(hwnd, kEventDeactivated);
      else e = makeEvent(hwnd, kEventActivated);
      break;
    case WM_CREATE: e = makeEvent(hwnd, kEventCreate); break;
    case WM_TIMER:
      if (wParam == kTrackingTimer && trackingTimer_) {
        checkMouseLeft(hwnd);
        return true;
      }
      e = makeEvent(hwnd, kEventTimer);
      e->params[0] = static_cast<std::intptr_t>(wParam);
      break;
    case WM_SETCURSOR:
      e = makeEvent(hwnd, kEventSetCursor);
      e->params[0] = static_cast<std::intptr_t>(wParam);
      break;
    default:
      break;
  }
  queue(std::move(e));
  return false;
}

}  // namespace toolkit
