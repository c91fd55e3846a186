#pragma once
// The native side of a component: its window handle, the mouse-tracking timer
// and the queue of events waiting to be dispatched. The toolkit window procedure
// hands every message of the component's windows to handleMessage, which turns
// it into events, queues them and drains the queue through the component.
// Accessibility clients asking a self-drawn component's window for its object
// get the component's accessible object, made on the first request and kept
// while the window lives.

#include <windows.h>

#include <deque>
#include <memory>

#include "toolkit/core/ToolkitEvent.h"

namespace toolkit {

class ComponentAccessible;
class cXComponent;

class ComponentPeer {
public:
  static constexpr UINT_PTR kTrackingTimer = 0xF000;
  static constexpr UINT kTrackingPeriodMs = 20;

  ComponentPeer(cXComponent& owner, int kind);
  // Kills the tracking timer, destroys the window if it still exists and frees
  // the queued events.
  ~ComponentPeer();
  ComponentPeer(const ComponentPeer&) = delete;
  ComponentPeer& operator=(const ComponentPeer&) = delete;

  HWND hwnd() const { return hwnd_; }
  void setHwnd(HWND hwnd) { hwnd_ = hwnd; }
  cXComponent& owner() const { return owner_; }
  int kind() const { return kind_; }
  UINT_PTR trackingTimer() const { return trackingTimer_; }
  size_t queuedEvents() const { return queue_.size(); }

  void queue(std::unique_ptr<ToolkitEvent> event);
  // Dispatches every queued event in order through the owner; answers whether the
  // last one dispatched was marked handled.
  bool drain();

  // One message of window `hwnd` (the peer's own window or a native control
  // adopted by the component). Answers whether the message was consumed; for
  // WM_GETFONT `result` receives the font.
  bool handleMessage(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam, LRESULT& result);

  // The window `hwnd` is gone (WM_NCDESTROY).
  void windowGone(HWND hwnd);

  // While the component is being destroyed its events are dropped, not dispatched,
  // and accessibility clients get nothing more from it.
  void silence();

private:
  using Event = std::unique_ptr<ToolkitEvent>;

  Event makeEvent(HWND hwnd, int id) const;
  bool answerFont(LRESULT& result) const;
  bool followEnable(WPARAM wParam);
  bool answerObject(HWND hwnd, WPARAM wParam, LPARAM lParam, LRESULT& result);
  void dropAccessible();
  bool translate(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam);
  Event eventFor(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam);
  // eventFor's handlers, each making the event of one kind of message.
  Event valueEvent(HWND hwnd, int id, WPARAM wParam) const;  // params[0] = wParam
  Event commandEvent(HWND hwnd, WPARAM wParam, LPARAM lParam) const;
  Event notifyEvent(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) const;
  Event keyEvent(HWND hwnd, int id, WPARAM key, LPARAM lParam) const;
  Event mouseDownEvent(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) const;
  Event mouseMoveEvent(HWND hwnd, WPARAM wParam, LPARAM lParam) const;
  Event mouseUpEvent(HWND hwnd, UINT message, WPARAM wParam, LPARAM lParam) const;
  Event wheelEvent(HWND hwnd, WPARAM wParam, LPARAM lParam) const;
  Event scrollEvent(HWND hwnd, WPARAM wParam, bool horizontal) const;
  Event destroyEvent(HWND hwnd);
  Event sizeEvent(HWND hwnd, WPARAM wParam, LPARAM lParam) const;
  void trackMouse(HWND hwnd);
  void checkMouseLeft(HWND hwnd);
  void stopTracking();

  cXComponent& owner_;
  int kind_;
  HWND hwnd_ = nullptr;
  UINT_PTR trackingTimer_ = 0;
  std::deque<std::unique_ptr<ToolkitEvent>> queue_;
  bool silent_ = false;
  ComponentAccessible* accessible_ = nullptr;  // one reference, held while the window lives
  // Shared with running drains so they notice when a handler deleted the component.
  std::shared_ptr<bool> alive_;
};

}  // namespace toolkit
