#include "inspector/InspectorUnitsFace.h"

#include "inspector/XObjectInspector.h"

#include <oleauto.h>

namespace br::inspector {

STDMETHODIMP InspectorUnitsFace::SetOption(LONG value) {
  inspector_.Units().SetOption(value);
  return S_OK;
}

STDMETHODIMP InspectorUnitsFace::SetUnits(VARIANT units) {
  if (units.vt == VT_BSTR) {
    inspector_.Units().text.assign(units.bstrVal ? units.bstrVal : L"", units.bstrVal ? SysStringLen(units.bstrVal) : 0);
    inspector_.UnitsChanged();
    return S_OK;
  }
  VARIANT number;
  VariantInit(&number);
  if (FAILED(VariantChangeType(&number, &units, 0, VT_I4))) return E_INVALIDARG;
  inspector_.Units().units = number.lVal;
  inspector_.UnitsChanged();
  return S_OK;
}

}  // namespace br::inspector
