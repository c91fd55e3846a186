// IOleInPlaceActiveObject of a control: what the container's frame calls while the
// control is UI-active (accelerators, activation of the frame and document windows).
#pragma once

#include "frame/com/Companion.h"

#include <oleidl.h>

namespace br::control {

class ControlCore;

class InPlaceActiveObjectFace final : public br::com::Companion<IOleInPlaceActiveObject> {
public:
  InPlaceActiveObjectFace(IUnknown& owner, ControlCore& core) noexcept : Companion(owner), core_(core) {}

  STDMETHODIMP GetWindow(HWND* window) override;
  STDMETHODIMP ContextSensitiveHelp(BOOL enterMode) override;
  STDMETHODIMP TranslateAccelerator(LPMSG message) override;
  STDMETHODIMP OnFrameWindowActivate(BOOL activate) override;
  STDMETHODIMP OnDocWindowActivate(BOOL activate) override;
  STDMETHODIMP ResizeBorder(LPCRECT border, IOleInPlaceUIWindow* window, BOOL frameWindow) override;
  STDMETHODIMP EnableModeless(BOOL enable) override;

private:
  ControlCore& core_;
};

}  // namespace br::control
