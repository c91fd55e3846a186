// cXComponent's event side: painting, the dispatch of a toolkit event to its handler, and
// the handlers' defaults (an event left unanswered bubbles to the parent).
#include "toolkit/core/cXComponent.h"

#include "toolkit/core/Container.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/widgets/Tooltip.h"

namespace toolkit {

int cXComponent::onPaint(ToolkitEvent& event) {
  // Only this component's own window: an adopted native control paints itself.
  if (event.source != this || !isValid() || event.hwnd != peer_->hwnd()) return 0;
  PAINTSTRUCT ps;
  HDC dc = BeginPaint(peer_->hwnd(), &ps);
  if (dc && redrawEnabled_) paint(dc);
  EndPaint(peer_->hwnd(), &ps);
  return 1;
}

void cXComponent::paint(HDC) {}

void cXComponent::focusIfSource(const ToolkitEvent& event) {
  // hasHandle also covers a native control that speaks for this component.
  if (event.source == this && isValid() && !hasHandle(GetFocus())) requestFocus();
}

int cXComponent::dispatchEvent(ToolkitEvent& event) {
  int answer = 0;
  switch (event.id) {
    case kEventAction: answer = onAction(event); break;
    case kEventNotify: answer = onNotify(event); break;
    case kEventFocusGained: answer = onFocusGained(event); break;
    case kEventKeyDown:
      if (event.params[0] == VK_TAB) {
        transferFocus();
        return 1;
      }
      focusIfSource(event);
      answer = onKeyDown(event, event.param(0));
      break;
    case kEventKeyUp: answer = onKeyUp(event, event.param(0)); break;
    case kEventChar:
      // Tab's character comes after its key has moved the focus on: it must not pull it back.
      if (event.params[0] != '\t') focusIfSource(event);
      answer = onChar(event, event.param(0));
      break;
    case kEventFocusLost: answer = onFocusLost(event); break;
    case kEventMouseDown:
      focusIfSource(event);
      answer = onMouseDown(event, event.param(0), event.param(1));
      break;
    case kEventMouseDrag: answer = onMouseDrag(event, event.param(0), event.param(1)); break;
    case kEventMouseEnter: answer = onMouseEnter(event, event.param(0), event.param(1)); break;
    case kEventMouseExit: answer = onMouseExit(event, event.param(0), event.param(1)); break;
    case kEventMouseMove: answer = onMouseMove(event, event.param(0), event.param(1)); break;
    case kEventMouseUp: answer = onMouseUp(event, event.param(0), event.param(1)); break;
    case kEventScrollThumb:
    case kEventScrollLineDown:
    case kEventScrollLineUp:
    case kEventScrollPageDown:
    case kEventScrollPageUp: answer = onScroll(event); break;
    case kEventMaximized:
    case kEventMinimized:
    case kEventResized: answer = onResized(event); break;
    case kEventMoved: answer = onMoved(event); break;
    case kEventPaint: answer = onPaint(event); break;
    case kEventEraseBackground: answer = onEraseBackground(event); break;
    case kEventSetCursor: answer = onSetCursor(event); break;
    default: break;  // no handler: straight to the parent
  }
  if (answer != 0) return answer;
  return parent_ ? parent_->dispatchEvent(event) : 0;
}

int cXComponent::onAction(ToolkitEvent&) { return 0; }
int cXComponent::onKeyDown(ToolkitEvent&, int) { return 0; }
int cXComponent::onKeyUp(ToolkitEvent&, int) { return 0; }
int cXComponent::onChar(ToolkitEvent&, int) { return 0; }
int cXComponent::onMouseDown(ToolkitEvent&, int, int) { return 0; }
int cXComponent::onMouseUp(ToolkitEvent&, int, int) { return 0; }
int cXComponent::onMouseMove(ToolkitEvent&, int, int) { return 0; }
int cXComponent::onMouseDrag(ToolkitEvent&, int, int) { return 0; }
int cXComponent::onMouseEnter(ToolkitEvent&, int, int) { return 0; }
int cXComponent::onMouseExit(ToolkitEvent&, int, int) { return 0; }
int cXComponent::onFocusGained(ToolkitEvent&) { return 0; }
int cXComponent::onFocusLost(ToolkitEvent&) { return 0; }
int cXComponent::onScroll(ToolkitEvent&) { return 0; }
int cXComponent::onMoved(ToolkitEvent&) { return 0; }
int cXComponent::onResized(ToolkitEvent&) { return 0; }

int cXComponent::onEraseBackground(ToolkitEvent& event) {
  // Components paint their whole area; erasing first would only flicker.
  if (event.source != this) return 0;
  event.handled = true;
  return 1;
}

int cXComponent::onSetCursor(ToolkitEvent&) { return 0; }
int cXComponent::onNotify(ToolkitEvent&) { return 0; }

}  // namespace toolkit
