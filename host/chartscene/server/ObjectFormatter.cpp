#include "host/chartscene/server/ObjectFormatter.h"

#include <wrl/client.h>

#include "host/chartscene/model/scene_counters.h"
#include "host/chartscene/server/base_catalogue.h"
#include "host/chartscene/server/scene_text.h"
#include "host/chartscene/server/value_texts.h"

using Microsoft::WRL::ComPtr;

namespace br::chartscene {

namespace {

HRESULT Fault(const char* operation) {
  const auto fault = CallAndFault(operation);
  return fault ? static_cast<HRESULT>(*fault) : S_OK;
}

HRESULT Answer(const std::wstring& text, BSTR* out) {
  *out = BstrFromWide(text);
  return *out ? S_OK : E_OUTOFMEMORY;
}

}  // namespace

ObjectFormatter::ObjectFormatter() : ComObject<IObjectFormatter>("ObjectFormatter") {}

HRESULT ObjectFormatter::Create(IUnknown** object) {
  *object = static_cast<IObjectFormatter*>(new ObjectFormatter);
  return S_OK;
}

STDMETHODIMP ObjectFormatter::SetOption(long id, VARIANT value) {
  if (const HRESULT fault = Fault("IObjectFormatter.SetOption"); fault != S_OK) return fault;
  std::string record = "VT" + std::to_string(value.vt);
  if (value.vt == VT_I4) {
    record = "I4:" + std::to_string(value.lVal);
    if (id == 61) language_ = value.lVal;
  } else if (value.vt == VT_BSTR) {
    record = "BSTR:" + Utf8FromWide(value.bstrVal, value.bstrVal ? SysStringLen(value.bstrVal) : 0);
    if (id == 64) missing_.assign(value.bstrVal ? value.bstrVal : L"", value.bstrVal ? SysStringLen(value.bstrVal) : 0);
  }
  RecordFormatterOption(id, record);
  return S_OK;
}

HRESULT ObjectFormatter::AttributeText(IGeoAttribute* attribute, const std::wstring& listSeparator,
                                       std::wstring& text) const {
  long code = 0;
  HRESULT hr = attribute->GetCode(&code);
  if (FAILED(hr)) return hr;
  VARIANT value;
  VariantInit(&value);
  hr = attribute->GetValue(&value);
  if (FAILED(hr)) {
    VariantClear(&value);
    return hr;
  }
  ComPtr<IUnknown> owner;
  ComPtr<IGeoObject> object;
  ComPtr<IGeoCatalog> catalogue;
  if (SUCCEEDED(attribute->GetOwner(&owner)) && owner && SUCCEEDED(owner.As(&object))) {
    *catalogue.GetAddressOf() = CatalogueOfObject(object.Get());
  }
  std::wstring name = AttributeNameText(catalogue.Get(), code);
  if (name.empty()) name = std::to_wstring(code);
  text = name + L"=" + ValueText(catalogue.Get(), code, value, listSeparator, missing_);
  VariantClear(&value);
  return S_OK;
}

STDMETHODIMP ObjectFormatter::FormatObject(long, long flags, IGeoObject* object, long, long, BSTR* text) {
  if (text == nullptr) return E_POINTER;
  *text = nullptr;
  if (const HRESULT fault = Fault("IObjectFormatter.FormatObject"); fault != S_OK) return fault;
  if (object == nullptr) return E_POINTER;
  long classCode = 0;
  HRESULT hr = object->GetClassCode(&classCode);
  if (FAILED(hr)) return hr;
  ComPtr<IGeoCatalog> catalogue;
  *catalogue.GetAddressOf() = CatalogueOfObject(object);
  std::wstring className = ClassNameText(catalogue.Get(), classCode);
  if (className.empty()) className = std::to_wstring(classCode);

  if ((flags & 2) != 0) {
    BSTR own = nullptr;
    std::wstring label = className;
    if (SUCCEEDED(object->GetText(&own)) && own != nullptr && SysStringLen(own) > 0) {
      label += L" " + std::wstring(own, SysStringLen(own));
    }
    SysFreeString(own);
    return Answer(label, text);
  }
  if ((flags & 4) == 0) return E_INVALIDARG;
  ComPtr<IGeoObjectEnum> attributes;
  hr = object->GetAttributes(&attributes);
  if (FAILED(hr)) return hr;
  if (!attributes) return E_FAIL;  // a success that handed out nothing
  std::wstring all = className + L"#";
  bool first = true;
  for (int guard = 0; guard < 100000; ++guard) {
    IUnknown* item = nullptr;
    ULONG fetched = 0;
    if (attributes->Next(1, &item, &fetched) != S_OK || fetched == 0 || item == nullptr) {
      if (item) item->Release();
      break;
    }
    ComPtr<IGeoAttribute> attribute;
    std::wstring one;
    if (SUCCEEDED(item->QueryInterface(IID_IGeoAttribute, reinterpret_cast<void**>(attribute.GetAddressOf()))) &&
        SUCCEEDED(AttributeText(attribute.Get(), L", ", one))) {
      if (!first) all += L"|";
      all += one;
      first = false;
    }
    item->Release();
  }
  return Answer(all, text);
}

STDMETHODIMP ObjectFormatter::FormatAttribute(long, long flags, IGeoAttribute* attribute, long, long, BSTR* text) {
  if (text == nullptr) return E_POINTER;
  *text = nullptr;
  if (const HRESULT fault = Fault("IObjectFormatter.FormatAttribute"); fault != S_OK) return fault;
  if (attribute == nullptr) return E_POINTER;
  if ((flags & 4) == 0) return E_INVALIDARG;
  std::wstring one;
  const HRESULT hr = AttributeText(attribute, L"|", one);
  if (FAILED(hr)) return hr;
  return Answer(one, text);
}

STDMETHODIMP ObjectFormatter::GetAttributeName(REFGUID kind, long, long code, long, long, BSTR* name) {
  if (name == nullptr) return E_POINTER;
  *name = nullptr;
  if (const HRESULT fault = Fault("IObjectFormatter.GetAttributeName"); fault != S_OK) return fault;
  if (!IsEqualGUID(kind, GEOKIND_CHART_DATABASE)) return E_INVALIDARG;
  std::string error;
  const S57Catalogue* catalogue = BaseCatalogue(error);
  const CatalogueAttribute* attribute = catalogue ? catalogue->AttributeByCode(code) : nullptr;
  if (attribute == nullptr) return E_INVALIDARG;
  return Answer(WideFromCp1252(attribute->name), name);
}

}  // namespace br::chartscene
