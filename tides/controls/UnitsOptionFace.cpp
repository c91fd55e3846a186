#include "tides/controls/UnitsOptionFace.h"

#include "tides/controls/TidesWindow.h"

#include <oleauto.h>

namespace br::tides {

STDMETHODIMP UnitsOptionFace::SetOption(LONG) { return S_OK; }

STDMETHODIMP UnitsOptionFace::SetUnits(VARIANT units) {
  VARIANT number;
  VariantInit(&number);
  if (FAILED(VariantChangeType(&number, &units, 0, VT_I4))) return E_INVALIDARG;
  return window_.SetFeet(number.lVal);
}

}  // namespace br::tides
