// ISpecifyPropertyPages of a control: the controls have no property pages.
#pragma once

#include "frame/com/Companion.h"

#include <ocidl.h>

namespace br::control {

class PropertyPagesFace final : public br::com::Companion<ISpecifyPropertyPages> {
public:
  explicit PropertyPagesFace(IUnknown& owner) noexcept : Companion(owner) {}

  STDMETHODIMP GetPages(CAUUID* pages) override;
};

}  // namespace br::control
