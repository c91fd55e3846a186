// IUnitsOption of TidesWindow: height labels in feet.
#pragma once

#include "frame/com/Companion.h"

#include "BR_Private.h"

namespace br::tides {

class TidesWindow;

class UnitsOptionFace final : public br::com::Companion<IUnitsOption> {
public:
  UnitsOptionFace(IUnknown& owner, TidesWindow& window) noexcept : Companion(owner), window_(window) {}

  // Accepted and ignored.
  STDMETHODIMP SetOption(LONG value) override;
  // Nonzero (after conversion to a 32-bit integer) shows the height labels in feet.
  STDMETHODIMP SetUnits(VARIANT units) override;

private:
  TidesWindow& window_;
};

}  // namespace br::tides
