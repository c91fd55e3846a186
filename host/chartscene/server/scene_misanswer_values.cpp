#include "host/chartscene/server/scene_misanswer_values.h"

#include <cstring>
#include <string>

namespace br::chartscene {

namespace {

BSTR HugeText() {
  const std::wstring text(kHugeTextLength, L'x');
  return SysAllocStringLen(text.data(), static_cast<UINT>(text.size()));
}

// Two dimensions of rows x 2 elements, all zero (empty VARIANTs for VT_VARIANT).
SAFEARRAY* TwoDimensions(VARTYPE element, ULONG rows) {
  SAFEARRAYBOUND bounds[2] = {{rows, 0}, {2, 0}};
  return SafeArrayCreate(element, 2, bounds);
}

}  // namespace

bool MisanswerVariant(const char* operation, VARIANT* value, VARTYPE element) {
  if (Misanswers(operation, Misanswer::WrongType)) {
    value->bstrVal = SysAllocString(L"misanswer");
    if (value->bstrVal) value->vt = VT_BSTR;
    return true;
  }
  if (Misanswers(operation, Misanswer::WrongShape)) {
    // Half the usual parameter count in each column: as many elements as one row of 34.
    value->parray = TwoDimensions(element, element == VT_UI1 ? 296 : 17);
    if (value->parray) value->vt = VT_ARRAY | element;
    return true;
  }
  if (Misanswers(operation, Misanswer::NullOut)) return true;
  if (Misanswers(operation, Misanswer::HugeText)) {
    value->bstrVal = HugeText();
    if (value->bstrVal) value->vt = VT_BSTR;
    return true;
  }
  return false;
}

bool MisanswerByteArray(const char* operation, SAFEARRAY** array, ULONG usualBytes) {
  if (Misanswers(operation, Misanswer::WrongType)) {
    *array = SafeArrayCreateVector(VT_BSTR, 0, usualBytes);
    return true;
  }
  if (Misanswers(operation, Misanswer::WrongShape)) {
    *array = TwoDimensions(VT_UI1, (usualBytes + 1) / 2);
    return true;
  }
  if (Misanswers(operation, Misanswer::NullOut)) return true;
  if (Misanswers(operation, Misanswer::HugeText)) {
    *array = SafeArrayCreateVector(VT_UI1, 0, static_cast<ULONG>(kHugeTextLength));
    void* bytes = nullptr;
    if (*array && SUCCEEDED(SafeArrayAccessData(*array, &bytes))) {
      std::memset(bytes, 'x', kHugeTextLength);
      SafeArrayUnaccessData(*array);
    }
    return true;
  }
  return false;
}

}  // namespace br::chartscene
