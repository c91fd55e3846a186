// IOleControl of a control: no mnemonics; ambient property changes are taken as they
// come (the controls read no ambient properties); event freezing is counted.
#pragma once

#include "frame/com/Companion.h"

#include <ocidl.h>

namespace br::control {

class OleControlFace final : public br::com::Companion<IOleControl> {
public:
  explicit OleControlFace(IUnknown& owner) noexcept : Companion(owner) {}

  STDMETHODIMP GetControlInfo(CONTROLINFO* info) override;
  STDMETHODIMP OnMnemonic(MSG* message) override;
  STDMETHODIMP OnAmbientPropertyChange(DISPID id) override;
  STDMETHODIMP FreezeEvents(BOOL freeze) override;

  LONG FreezeCount() const noexcept { return freezeCount_; }

private:
  LONG freezeCount_ = 0;
};

}  // namespace br::control
