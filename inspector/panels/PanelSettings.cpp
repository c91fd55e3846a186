#include "inspector/panels/PanelSettings.h"

#include <string>

#include "frame/settings/localised_texts.h"

namespace br::inspector {

namespace {

constexpr long kOptionLanguage = 61;
constexpr long kOptionMissingText = 64;
constexpr long kFormatterUnits = 62;
constexpr long kFormatterUnitsText = 63;

std::wstring Wide(const std::string& ansi) {
  if (ansi.empty()) return {};
  const int size = MultiByteToWideChar(CP_ACP, 0, ansi.data(), static_cast<int>(ansi.size()), nullptr, 0);
  std::wstring wide(static_cast<std::size_t>(size > 0 ? size : 0), L'\0');
  if (size > 0) MultiByteToWideChar(CP_ACP, 0, ansi.data(), static_cast<int>(ansi.size()), wide.data(), size);
  return wide;
}

}  // namespace

PanelSettings::PanelSettings() { RegisterTextClient(this); }

PanelSettings::~PanelSettings() {
  formatter_.Reset();
  UnregisterTextClient(this);
}

HRESULT PanelSettings::Create() {
  formatter_.Reset();
  HRESULT hr = CoCreateInstance(CLSID_ObjectFormatter, nullptr, CLSCTX_ALL, IID_IObjectFormatter,
                                reinterpret_cast<void**>(formatter_.GetAddressOf()));
  if (FAILED(hr)) {
    formatter_.Reset();
    return hr;
  }
  // The text first: it makes the localiser that knows the language.
  const std::wstring missing = Wide(GetText("ObjInspector", 55, "unknown"));
  long current = 0;
  if (SUCCEEDED(GetLanguage(&current))) language = current;
  VARIANT option;
  VariantInit(&option);
  option.vt = VT_I4;
  option.lVal = language;
  formatter_->SetOption(kOptionLanguage, option);
  option.vt = VT_BSTR;
  option.bstrVal = SysAllocString(missing.c_str());
  formatter_->SetOption(kOptionMissingText, option);
  VariantClear(&option);
  return S_OK;
}

HRESULT PanelSettings::SetUnits(long units) {
  if (!formatter_) return S_FALSE;
  VARIANT value;
  VariantInit(&value);
  value.vt = VT_I4;
  value.lVal = units;
  return formatter_->SetOption(kFormatterUnits, value);
}

HRESULT PanelSettings::SetUnitsText(const std::wstring& text) {
  if (!formatter_) return S_FALSE;
  VARIANT value;
  VariantInit(&value);
  value.vt = VT_BSTR;
  value.bstrVal = SysAllocStringLen(text.data(), static_cast<UINT>(text.size()));
  if (!value.bstrVal) return E_OUTOFMEMORY;
  const HRESULT hr = formatter_->SetOption(kFormatterUnitsText, value);
  VariantClear(&value);
  return hr;
}

}  // namespace br::inspector
