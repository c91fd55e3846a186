#include "frame/control/InPlaceActiveObjectFace.h"

#include "frame/com/guard.h"
#include "frame/control/ControlCore.h"

namespace br::control {

STDMETHODIMP InPlaceActiveObjectFace::GetWindow(HWND* window) {
  if (!window) return E_POINTER;
  *window = core_.Window();
  return *window ? S_OK : E_FAIL;
}

STDMETHODIMP InPlaceActiveObjectFace::ContextSensitiveHelp(BOOL) { return E_NOTIMPL; }

STDMETHODIMP InPlaceActiveObjectFace::TranslateAccelerator(LPMSG message) {
  if (!message) return E_POINTER;
  return br::com::Guarded(core_.Class(), [&] { return core_.Hooks().TranslateAccelerator(message); });
}

STDMETHODIMP InPlaceActiveObjectFace::OnFrameWindowActivate(BOOL) { return S_OK; }
STDMETHODIMP InPlaceActiveObjectFace::OnDocWindowActivate(BOOL) { return S_OK; }
STDMETHODIMP InPlaceActiveObjectFace::ResizeBorder(LPCRECT, IOleInPlaceUIWindow*, BOOL) { return S_OK; }
STDMETHODIMP InPlaceActiveObjectFace::EnableModeless(BOOL) { return S_OK; }

}  // namespace br::control
