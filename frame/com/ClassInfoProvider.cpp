#include "frame/com/ClassInfoProvider.h"

#include "frame/com/TypeLibrary.h"

namespace br::com {

STDMETHODIMP ClassInfoProvider::GetClassInfo(ITypeInfo** out) {
  if (!out) return E_POINTER;
  return TypeLibrary::TypeInfoOf(*class_.clsid, out);
}

STDMETHODIMP ClassInfoProvider::GetGUID(DWORD kind, GUID* out) {
  if (!out) return E_POINTER;
  if (kind != GUIDKIND_DEFAULT_SOURCE_DISP_IID) {
    *out = GUID_NULL;
    return E_INVALIDARG;
  }
  *out = class_.events ? *class_.events : GUID_NULL;
  return S_OK;
}

}  // namespace br::com
