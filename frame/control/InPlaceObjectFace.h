// IOleInPlaceObjectWindowless (with IOleInPlaceObject and IOleWindow) of a control. The
// controls always activate with a window of their own, so the windowless calls have
// nothing to do.
#pragma once

#include "frame/com/Companion.h"

#include <ocidl.h>

namespace br::control {

class ControlCore;

class InPlaceObjectFace final : public br::com::Companion<IOleInPlaceObjectWindowless> {
public:
  InPlaceObjectFace(IUnknown& owner, ControlCore& core) noexcept : Companion(owner), core_(core) {}

  STDMETHODIMP GetWindow(HWND* window) override;
  STDMETHODIMP ContextSensitiveHelp(BOOL enterMode) override;
  STDMETHODIMP InPlaceDeactivate() override;
  STDMETHODIMP UIDeactivate() override;
  STDMETHODIMP SetObjectRects(LPCRECT position, LPCRECT clip) override;
  STDMETHODIMP ReactivateAndUndo() override;
  STDMETHODIMP OnWindowMessage(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) override;
  STDMETHODIMP GetDropTarget(IDropTarget** target) override;

private:
  ControlCore& core_;
};

}  // namespace br::control
