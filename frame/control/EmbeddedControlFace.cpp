#include "frame/control/EmbeddedControlFace.h"

#include "frame/com/guard.h"
#include "frame/control/ControlCore.h"

namespace br::control {

STDMETHODIMP EmbeddedControlFace::SetPalette(VARIANT palette) {
  return br::com::Guarded(core_.Class(), [&] { return core_.Hooks().SetPalette(palette); });
}

STDMETHODIMP EmbeddedControlFace::Reserved(LONG, LONG) { return S_OK; }

STDMETHODIMP EmbeddedControlFace::SetFont(LONG, IFont* font, LONG) {
  return br::com::Guarded(core_.Class(), [&] { return core_.Hooks().SetFont(font); });
}

STDMETHODIMP EmbeddedControlFace::GetPreferredSize(LONG* width, LONG* height) {
  return br::com::Guarded(core_.Class(), [&] { return core_.Hooks().GetPreferredSize(width, height); });
}

}  // namespace br::control
