#include "frame/control/OleControlFace.h"

namespace br::control {

STDMETHODIMP OleControlFace::GetControlInfo(CONTROLINFO* info) {
  if (!info) return E_POINTER;
  info->hAccel = nullptr;
  info->cAccel = 0;
  info->dwFlags = 0;
  return S_OK;
}

STDMETHODIMP OleControlFace::OnMnemonic(MSG*) { return E_NOTIMPL; }

STDMETHODIMP OleControlFace::OnAmbientPropertyChange(DISPID) { return S_OK; }

STDMETHODIMP OleControlFace::FreezeEvents(BOOL freeze) {
  if (freeze) {
    ++freezeCount_;
  } else if (freezeCount_ > 0) {
    --freezeCount_;
  }
  return S_OK;
}

}  // namespace br::control
