// IUnitsOption of XObjectInspector: an option number and the units the panels show values in.
#pragma once

#include "frame/com/Companion.h"

#include "BR_Private.h"

namespace br::inspector {

class XObjectInspector;

class InspectorUnitsFace final : public br::com::Companion<IUnitsOption> {
public:
  InspectorUnitsFace(IUnknown& owner, XObjectInspector& inspector) noexcept
      : Companion(owner), inspector_(inspector) {}

  // Stored; 1 is remembered as such, and any non-zero value gives the control its own
  // units record for the panels to read.
  STDMETHODIMP SetOption(LONG value) override;
  // A string is kept as the option text; anything else must convert to a 32-bit number
  // (E_INVALIDARG when it does not). Either goes on to the formatter, and the shown details
  // are filled again in the new units.
  STDMETHODIMP SetUnits(VARIANT units) override;

private:
  XObjectInspector& inspector_;
};

}  // namespace br::inspector
