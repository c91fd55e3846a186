// IEmbeddedControl, the library's own control interface: palette, a reserved no-op,
// font and preferred size. The control's hooks give the answers.
#pragma once

#include "frame/com/Companion.h"

#include "BR_Private.h"

namespace br::control {

class ControlCore;

class EmbeddedControlFace final : public br::com::Companion<IEmbeddedControl> {
public:
  EmbeddedControlFace(IUnknown& owner, ControlCore& core) noexcept : Companion(owner), core_(core) {}

  STDMETHODIMP SetPalette(VARIANT palette) override;
  STDMETHODIMP Reserved(LONG value1, LONG value2) override;
  STDMETHODIMP SetFont(LONG value1, IFont* font, LONG value2) override;
  STDMETHODIMP GetPreferredSize(LONG* width, LONG* height) override;

private:
  ControlCore& core_;
};

}  // namespace br::control
