#include "host/chartscene/server/scene_variants.h"

#include <cstring>

#include "host/chartscene/server/scene_text.h"

namespace br::chartscene {

SAFEARRAY* ByteArray(const std::vector<unsigned char>& data) {
  SAFEARRAY* array = SafeArrayCreateVector(VT_UI1, 0, static_cast<ULONG>(data.size()));
  if (array == nullptr) return nullptr;
  void* bytes = nullptr;
  if (SUCCEEDED(SafeArrayAccessData(array, &bytes))) {
    if (!data.empty()) std::memcpy(bytes, data.data(), data.size());
    SafeArrayUnaccessData(array);
  }
  return array;
}

HRESULT VariantFromTyped(const TypedValue& value, VARIANT* out) {
  VariantInit(out);
  using Type = TypedValue::Type;
  switch (value.type) {
    case Type::Empty: return S_OK;
    case Type::I1: out->vt = VT_I1; out->cVal = static_cast<CHAR>(value.integer); return S_OK;
    case Type::I2: out->vt = VT_I2; out->iVal = static_cast<SHORT>(value.integer); return S_OK;
    case Type::I4: out->vt = VT_I4; out->lVal = static_cast<LONG>(value.integer); return S_OK;
    case Type::UI1: out->vt = VT_UI1; out->bVal = static_cast<BYTE>(value.integer); return S_OK;
    case Type::UI2: out->vt = VT_UI2; out->uiVal = static_cast<USHORT>(value.integer); return S_OK;
    case Type::UI4: out->vt = VT_UI4; out->ulVal = static_cast<ULONG>(value.integer); return S_OK;
    case Type::R4: out->vt = VT_R4; out->fltVal = static_cast<FLOAT>(value.real); return S_OK;
    case Type::R8: out->vt = VT_R8; out->dblVal = value.real; return S_OK;
    case Type::Date: out->vt = VT_DATE; out->date = value.real; return S_OK;
    case Type::Bool: out->vt = VT_BOOL; out->boolVal = value.integer ? VARIANT_TRUE : VARIANT_FALSE; return S_OK;
    case Type::Text:
      out->bstrVal = BstrFromUtf8(value.text);
      if (out->bstrVal == nullptr) return E_OUTOFMEMORY;
      out->vt = VT_BSTR;
      return S_OK;
    case Type::ByteList:
    case Type::WordList: {
      const bool words = value.type == Type::WordList;
      SAFEARRAY* array = SafeArrayCreateVector(words ? VT_UI2 : VT_UI1, 0, static_cast<ULONG>(value.list.size()));
      if (array == nullptr) return E_OUTOFMEMORY;
      void* data = nullptr;
      if (SUCCEEDED(SafeArrayAccessData(array, &data))) {
        for (std::size_t i = 0; i < value.list.size(); ++i) {
          if (words) {
            static_cast<USHORT*>(data)[i] = static_cast<USHORT>(value.list[i]);
          } else {
            static_cast<BYTE*>(data)[i] = static_cast<BYTE>(value.list[i]);
          }
        }
        SafeArrayUnaccessData(array);
      }
      out->vt = static_cast<VARTYPE>(VT_ARRAY | (words ? VT_UI2 : VT_UI1));
      out->parray = array;
      return S_OK;
    }
  }
  return E_UNEXPECTED;
}

}  // namespace br::chartscene
