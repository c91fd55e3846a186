#pragma once
// One toolkit event, made from one window message (or by a component itself,
// e.g. fireAction). Events travel from their source up through the parents
// (cXComponent::dispatchEvent).

#include <windows.h>

#include <cstdint>

namespace toolkit {

class cXComponent;

// Event ids. The comment gives the parameters (params[0], params[1], ...).
enum EventId : int {
  kEventAction = 0,           // made by fireAction and by widgets' notifications
  kEventCommand = 1,          // WM_COMMAND: notification code, control id, lParam
  kEventNotify = 2,           // sub-kind (1 WM_NOTIFY, 2 WM_DRAWITEM, 3 WM_MEASUREITEM), message, wParam, lParam
  kEventFocusGained = 3,      // WM_SETFOCUS
  kEventKeyDown = 4,          // virtual key, lParam
  kEventKeyUp = 5,            // virtual key, lParam
  kEventChar = 6,             // character (one byte), lParam
  kEventFocusLost = 7,        // WM_KILLFOCUS
  kEventMouseDown = 8,        // x, y (client), right-button flag, key state, double-click flag
  kEventMouseDrag = 9,        // x, y, right-button flag (a move with a button down)
  kEventMouseEnter = 10,      // cursor x, y (screen): first mouse message of a visit
  kEventMouseExit = 11,       // cursor x, y (screen): the cursor left the window
  kEventMouseMove = 12,       // x, y, key state
  kEventMouseUp = 13,         // x, y, right-button flag
  kEventMouseWheel = 14,      // x, y (screen), wParam
  kEventScrollThumb = 15,     // thumb position, horizontal flag
  kEventScrollLineDown = 16,  // horizontal flag
  kEventScrollLineUp = 17,    // horizontal flag
  kEventScrollPageDown = 18,  // horizontal flag
  kEventScrollPageUp = 19,    // horizontal flag
  kEventDestroy = 21,         // WM_DESTROY
  kEventMaximized = 22,       // width, height
  kEventMinimized = 23,       // width, height
  kEventMoved = 24,           // WM_MOVE
  kEventClose = 25,           // WM_CLOSE
  kEventResized = 26,         // width, height
  kEventPaint = 27,           // WM_PAINT
  kEventEraseBackground = 28, // HDC
  kEventActivated = 29,       // WM_ACTIVATE with WA_ACTIVE or WA_CLICKACTIVE
  kEventDeactivated = 30,     // WM_ACTIVATE with WA_INACTIVE
  kEventCreate = 31,          // WM_CREATE
  kEventTimer = 33,           // timer id (never the mouse-tracking timer)
  kEventSetCursor = 34,       // wParam
};

struct ToolkitEvent {
  static constexpr int kParamCount = 7;

  ToolkitEvent() = default;
  ToolkitEvent(cXComponent* eventSource, int eventId, HWND window)
      : source(eventSource), id(eventId), hwnd(window) {}

  cXComponent* source = nullptr;
  int id = 0;
  HWND hwnd = nullptr;           // the window whose message made the event
  // Set by a handler that takes over the window message itself: the window's
  // native procedure then never sees the message.
  bool handled = false;
  // Wide enough for the pointers that some messages carry (lParam, HDC).
  std::intptr_t params[kParamCount] = {};
  int keyState = -1;             // MK_* flags of a mouse message; -1 for others

  int param(int i) const { return static_cast<int>(params[i]); }
};

}  // namespace toolkit
