#include "frame/control/InPlaceObjectFace.h"

#include "frame/com/guard.h"
#include "frame/control/ControlCore.h"
#include "frame/control/OwnerHold.h"

namespace br::control {

STDMETHODIMP InPlaceObjectFace::GetWindow(HWND* window) {
  if (!window) return E_POINTER;
  *window = core_.Window();
  return *window ? S_OK : E_FAIL;
}

STDMETHODIMP InPlaceObjectFace::ContextSensitiveHelp(BOOL) { return E_NOTIMPL; }

STDMETHODIMP InPlaceObjectFace::InPlaceDeactivate() {
  OwnerHold hold(Owner());
  return br::com::Guarded(core_.Class(), [&] { return core_.InPlaceDeactivate(); });
}

STDMETHODIMP InPlaceObjectFace::UIDeactivate() {
  return br::com::Guarded(core_.Class(), [&] { return core_.UIDeactivate(); });
}

STDMETHODIMP InPlaceObjectFace::SetObjectRects(LPCRECT position, LPCRECT clip) {
  return core_.SetObjectRects(position, clip);
}

STDMETHODIMP InPlaceObjectFace::ReactivateAndUndo() { return E_NOTIMPL; }

STDMETHODIMP InPlaceObjectFace::OnWindowMessage(UINT, WPARAM, LPARAM, LRESULT* result) {
  // Never windowless-active: the control's own window gets its messages.
  if (result) *result = 0;
  return S_FALSE;
}

STDMETHODIMP InPlaceObjectFace::GetDropTarget(IDropTarget** target) {
  if (target) *target = nullptr;
  return E_NOTIMPL;
}

}  // namespace br::control
