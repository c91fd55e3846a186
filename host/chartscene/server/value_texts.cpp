#include "host/chartscene/server/value_texts.h"

#include <cwchar>
#include <vector>

#include <wrl/client.h>

using Microsoft::WRL::ComPtr;

namespace br::chartscene {

namespace {

template <typename Length, typename Text>
std::wstring CatalogueText(IGeoCatalog* catalogue, Length length, Text text) {
  if (catalogue == nullptr) return std::wstring();
  long size = 0;
  if (length(size) != S_OK || size < 0 || size > 4096) return std::wstring();
  std::vector<char> buffer(static_cast<std::size_t>(size) + 1, '\0');
  if (FAILED(text(size + 1, buffer.data()))) return std::wstring();
  buffer[static_cast<std::size_t>(size)] = '\0';
  return WideFromCp1252(buffer.data());
}

std::wstring Decimal(long long value) {
  wchar_t text[32];
  std::swprintf(text, 32, L"%lld", value);
  return text;
}

std::wstring Real(double value) {
  wchar_t text[64];
  std::swprintf(text, 64, L"%g", value);
  return text;
}

std::wstring Enumerated(IGeoCatalog* catalogue, long code, ULONG value) {
  const std::wstring text = EnumValueText(catalogue, code, value);
  return text.empty() ? Decimal(value) : text;
}

}  // namespace

std::wstring WideFromCp1252(const std::string& text) {
  if (text.empty()) return std::wstring();
  const int size = MultiByteToWideChar(1252, 0, text.data(), static_cast<int>(text.size()), nullptr, 0);
  std::wstring wide(size > 0 ? static_cast<std::size_t>(size) : 0, L'\0');
  if (size > 0) MultiByteToWideChar(1252, 0, text.data(), static_cast<int>(text.size()), &wide[0], size);
  return wide;
}

IGeoCatalog* CatalogueOfObject(IGeoObject* object) {
  if (object == nullptr) return nullptr;
  ComPtr<IGeoDataSet> dataSet;
  ComPtr<IGeoDatabase> database;
  IGeoCatalog* catalogue = nullptr;
  if (FAILED(object->GetDataSet(&dataSet)) || !dataSet || FAILED(dataSet->GetDatabase(&database)) || !database ||
      FAILED(database->QueryInterface(IID_IGeoCatalog, reinterpret_cast<void**>(&catalogue)))) {
    return nullptr;
  }
  return catalogue;
}

std::wstring ClassNameText(IGeoCatalog* catalogue, long classCode) {
  return CatalogueText(
      catalogue, [&](long& size) { return catalogue->GetClassNameLength(classCode, &size); },
      [&](long size, char* buffer) { return catalogue->GetClassNameText(classCode, size, buffer); });
}

std::wstring AttributeNameText(IGeoCatalog* catalogue, long code) {
  return CatalogueText(
      catalogue, [&](long& size) { return catalogue->GetAttributeNameLength(code, &size); },
      [&](long size, char* buffer) { return catalogue->GetAttributeNameText(code, size, buffer); });
}

std::wstring EnumValueText(IGeoCatalog* catalogue, long code, ULONG value) {
  return CatalogueText(
      catalogue, [&](long& size) { return catalogue->GetEnumTextLength(code, value, &size); },
      [&](long size, char* buffer) { return catalogue->GetEnumText(code, value, size, buffer); });
}

std::wstring ValueText(IGeoCatalog* catalogue, long code, const VARIANT& value, const std::wstring& separator,
                       const std::wstring& missing) {
  switch (value.vt) {
    case VT_EMPTY:
    case VT_NULL: return missing;
    case VT_UI1: return Enumerated(catalogue, code, value.bVal);
    case VT_UI2: return Enumerated(catalogue, code, value.uiVal);
    case VT_I1: return Decimal(value.cVal);
    case VT_I2: return Decimal(value.iVal);
    case VT_I4: return Decimal(value.lVal);
    case VT_UI4: return Decimal(value.ulVal);
    case VT_R4: return Real(value.fltVal);
    case VT_R8: return Real(value.dblVal);
    case VT_BSTR: return value.bstrVal ? std::wstring(value.bstrVal, SysStringLen(value.bstrVal)) : std::wstring();
    case VT_ARRAY | VT_UI1:
    case VT_ARRAY | VT_UI2: {
      std::wstring text;
      void* data = nullptr;
      if (value.parray == nullptr || SafeArrayGetDim(value.parray) != 1 ||
          FAILED(SafeArrayAccessData(value.parray, &data))) {
        return missing;
      }
      const ULONG count = value.parray->rgsabound[0].cElements;
      for (ULONG i = 0; i < count; ++i) {
        const ULONG item = value.vt == (VT_ARRAY | VT_UI1) ? static_cast<const BYTE*>(data)[i]
                                                           : static_cast<const USHORT*>(data)[i];
        if (i > 0) text += separator;
        text += Enumerated(catalogue, code, item);
      }
      SafeArrayUnaccessData(value.parray);
      return text;
    }
    default: {
      VARIANT converted;
      VariantInit(&converted);
      std::wstring text = missing;
      if (SUCCEEDED(VariantChangeType(&converted, const_cast<VARIANT*>(&value), 0, VT_BSTR)) && converted.bstrVal) {
        text.assign(converted.bstrVal, SysStringLen(converted.bstrVal));
      }
      VariantClear(&converted);
      return text;
    }
  }
}

}  // namespace br::chartscene
