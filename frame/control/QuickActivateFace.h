// IQuickActivate of a control: the container hands its site, advise sink and event sink
// in one call and learns the control's status flags.
#pragma once

#include "frame/com/Companion.h"

#include <ocidl.h>

namespace br::control {

class ControlCore;

class QuickActivateFace final : public br::com::Companion<IQuickActivate> {
public:
  QuickActivateFace(IUnknown& owner, ControlCore& core) noexcept : Companion(owner), core_(core) {}

  STDMETHODIMP QuickActivate(QACONTAINER* container, QACONTROL* control) override;
  STDMETHODIMP SetContentExtent(LPSIZEL size) override;
  STDMETHODIMP GetContentExtent(LPSIZEL size) override;

private:
  ControlCore& core_;
};

}  // namespace br::control
