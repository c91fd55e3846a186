#include "frame/control/child_windows.h"

#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/core/cXComponent.h"

namespace br::control {

namespace {

// The window's client top-left corner in the coordinates of origin's client area.
POINT ClientCorner(HWND window, HWND origin) {
  POINT corner{0, 0};
  MapWindowPoints(window, origin, &corner, 1);
  return corner;
}

void PaintOne(HWND child, HWND origin, HDC dc, POINT viewport) {
  RECT outer{};
  GetWindowRect(child, &outer);
  MapWindowPoints(HWND_DESKTOP, origin, reinterpret_cast<POINT*>(&outer), 2);
  RECT client{};
  GetClientRect(child, &client);
  const POINT corner = ClientCorner(child, origin);

  const int saved = SaveDC(dc);
  // Borders and scroll bars: the system's own frame drawing, where it offers one.
  if (outer.left != corner.x || outer.top != corner.y || outer.right - outer.left != client.right ||
      outer.bottom - outer.top != client.bottom) {
    SetViewportOrgEx(dc, viewport.x + outer.left, viewport.y + outer.top, nullptr);
    IntersectClipRect(dc, 0, 0, outer.right - outer.left, outer.bottom - outer.top);
    SendMessageW(child, WM_PRINT, reinterpret_cast<WPARAM>(dc), PRF_NONCLIENT);
    SetViewportOrgEx(dc, viewport.x, viewport.y, nullptr);
  }
  SetViewportOrgEx(dc, viewport.x + corner.x, viewport.y + corner.y, nullptr);
  IntersectClipRect(dc, 0, 0, client.right, client.bottom);
  SendMessageW(child, WM_ERASEBKGND, reinterpret_cast<WPARAM>(dc), 0);
  toolkit::cXComponent* component = toolkit::ToolkitWindows::componentOf(child);
  if (component && component->getHandle() == child && !toolkit::ToolkitWindows::previousProcOf(child)) {
    // A window of the toolkit's own class answers no WM_PRINTCLIENT: its component paints.
    const int beforePaint = SaveDC(dc);
    component->paint(dc);
    if (beforePaint) RestoreDC(dc, beforePaint);
  } else {
    SendMessageW(child, WM_PRINTCLIENT, reinterpret_cast<WPARAM>(dc), PRF_CLIENT);
  }
  // The child's own children, inside its client area.
  for (HWND inner = GetWindow(child, GW_CHILD) ? GetWindow(GetWindow(child, GW_CHILD), GW_HWNDLAST) : nullptr;
       inner; inner = GetWindow(inner, GW_HWNDPREV)) {
    if (GetWindowLongPtrW(inner, GWL_STYLE) & WS_VISIBLE) PaintOne(inner, origin, dc, viewport);
  }
  if (saved) RestoreDC(dc, saved);
}

}  // namespace

void PaintChildWindows(HWND window, HDC dc) {
  if (!window || !dc) return;
  POINT viewport{0, 0};
  GetViewportOrgEx(dc, &viewport);
  const HWND first = GetWindow(window, GW_CHILD);
  // Bottom of the z-order first, so that windows above paint over those below.
  for (HWND child = first ? GetWindow(first, GW_HWNDLAST) : nullptr; child; child = GetWindow(child, GW_HWNDPREV)) {
    if (GetWindowLongPtrW(child, GWL_STYLE) & WS_VISIBLE) PaintOne(child, window, dc, viewport);
  }
}

}  // namespace br::control
