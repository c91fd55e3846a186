#include "host/brchart/SceneClient.h"

#include <oleauto.h>

namespace br::brchart {

namespace {

// Dispatch ids of IChartScene.
constexpr DISPID kLoad = 1, kLastError = 2, kDataSet = 4, kObject = 5, kProjection = 6, kPresParams = 7, kColorMap = 8,
                 kPalette = 9, kObjectRecords = 10;

std::wstring Wide(const std::string& text) {
  const int n = MultiByteToWideChar(CP_ACP, 0, text.c_str(), -1, nullptr, 0);
  std::wstring out(n > 0 ? n - 1 : 0, L'\0');
  if (n > 1) MultiByteToWideChar(CP_ACP, 0, text.c_str(), -1, &out[0], n);
  return out;
}

std::string Narrow(const wchar_t* text) {
  if (!text) return "";
  const int n = WideCharToMultiByte(CP_ACP, 0, text, -1, nullptr, 0, nullptr, nullptr);
  std::string out(n > 0 ? n - 1 : 0, '\0');
  if (n > 1) WideCharToMultiByte(CP_ACP, 0, text, -1, &out[0], n, nullptr, nullptr);
  return out;
}

std::string Hex(HRESULT hr) {
  char text[16];
  wsprintfA(text, "0x%08lX", static_cast<unsigned long>(hr));
  return text;
}

}  // namespace

SceneClient::~SceneClient() {
  if (projection_) projection_->Release();
  if (scene_) scene_->Release();
  if (geodesy_) FreeLibrary(geodesy_);
}

HRESULT SceneClient::Call(DISPID id, WORD flags, VARIANT* arguments, UINT count, VARIANT* result) {
  DISPPARAMS params{arguments, nullptr, count, 0};
  return scene_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, flags, &params, result, nullptr, nullptr);
}

IUnknown* SceneClient::Named(DISPID id, const std::string& name) {
  VARIANT argument;
  VariantInit(&argument);
  argument.vt = VT_BSTR;
  argument.bstrVal = SysAllocString(Wide(name).c_str());
  VARIANT result;
  VariantInit(&result);
  const HRESULT hr = Call(id, DISPATCH_METHOD, &argument, 1, &result);
  VariantClear(&argument);
  IUnknown* out = nullptr;
  if (SUCCEEDED(hr) && (result.vt == VT_UNKNOWN || result.vt == VT_DISPATCH) && result.punkVal) {
    out = result.punkVal;
    out->AddRef();
  }
  VariantClear(&result);
  return out;
}

bool SceneClient::Open(const std::string& scenePath, const std::string& projection, std::string& error) {
  CLSID id{};
  if (FAILED(CLSIDFromProgID(L"ChartScene.Scene", &id)) ||
      FAILED(CoCreateInstance(id, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch, reinterpret_cast<void**>(&scene_)))) {
    error = "the chart host ChartScene.Scene is not registered";
    return false;
  }
  VARIANT path;
  VariantInit(&path);
  path.vt = VT_BSTR;
  path.bstrVal = SysAllocString(Wide(scenePath).c_str());
  const HRESULT loaded = Call(kLoad, DISPATCH_METHOD, &path, 1, nullptr);
  VariantClear(&path);
  if (FAILED(loaded)) {
    VARIANT why;
    VariantInit(&why);
    Call(kLastError, DISPATCH_PROPERTYGET, nullptr, 0, &why);
    error = "the chart host refused " + scenePath + ": " + (why.vt == VT_BSTR ? Narrow(why.bstrVal) : Hex(loaded));
    VariantClear(&why);
    return false;
  }
  if (IUnknown* found = Named(kProjection, projection)) {
    found->QueryInterface(IID_IGeoProjection, reinterpret_cast<void**>(&projection_));
    found->Release();
  }
  if (!projection_) {
    error = "the chart host has no projection " + projection;
    return false;
  }
  // The geodesy library lies beside the program (and BR_Info.dll).
  geodesy_ = LoadLibraryW(L"BRGBASE.dll");
  using InitMetrics = void(WINAPI*)(GEO_MAP_METRICS*, long);
  // Through void*: FARPROC has no arguments, and the warning about the cast says nothing here.
  const auto init = geodesy_ ? reinterpret_cast<InitMetrics>(
                                   reinterpret_cast<void*>(GetProcAddress(geodesy_, "TMapMetrics__init")))
                             : nullptr;
  if (!init) {
    error = "the geodesy library BRGBASE.dll is missing";
    return false;
  }
  init(&metrics_, 0);
  return true;
}

IGeoObject* SceneClient::Object(const std::string& name) {
  if (!scene_) return nullptr;
  IUnknown* found = Named(kObject, name);
  if (!found) return nullptr;
  IGeoObject* object = nullptr;
  found->QueryInterface(IID_IGeoObject, reinterpret_cast<void**>(&object));
  found->Release();
  return object;
}

IUnknown* SceneClient::DataSet(const std::string& id) { return scene_ ? Named(kDataSet, id) : nullptr; }

IUnknown* SceneClient::ProjectionObject() {
  if (!projection_) return nullptr;
  projection_->AddRef();
  return projection_;
}

IUnknown* SceneClient::PresParams(const std::string& name) { return scene_ ? Named(kPresParams, name) : nullptr; }

IUnknown* SceneClient::ColorMap(const std::string& name) { return scene_ ? Named(kColorMap, name) : nullptr; }

bool SceneClient::ObjectRecords(const std::string& names, VARIANT& records) {
  VariantInit(&records);
  if (!scene_) return false;
  VARIANT argument;
  VariantInit(&argument);
  argument.vt = VT_BSTR;
  argument.bstrVal = SysAllocString(Wide(names).c_str());
  const HRESULT hr = Call(kObjectRecords, DISPATCH_METHOD, &argument, 1, &records);
  VariantClear(&argument);
  if (FAILED(hr) || records.vt != (VT_ARRAY | VT_UI1)) {
    VariantClear(&records);
    return false;
  }
  return true;
}

long SceneClient::Palette(const std::string& name) {
  if (!scene_) return 0;
  VARIANT argument;
  VariantInit(&argument);
  argument.vt = VT_BSTR;
  argument.bstrVal = SysAllocString(Wide(name).c_str());
  VARIANT result;
  VariantInit(&result);
  const HRESULT hr = Call(kPalette, DISPATCH_METHOD, &argument, 1, &result);
  VariantClear(&argument);
  long handle = 0;
  if (SUCCEEDED(hr) && SUCCEEDED(VariantChangeType(&result, &result, 0, VT_I4))) handle = result.lVal;
  VariantClear(&result);
  return handle;
}

std::vector<std::string> SceneClient::HitTest(const std::vector<std::string>& candidates, const RECT& pixels) {
  std::vector<std::string> hits;
  if (!IsOpen()) return hits;
  for (const std::string& name : candidates) {
    IGeoObject* object = Object(name);
    if (!object) continue;
    if (object->HitTest(projection_, &pixels, &metrics_) == S_OK) hits.push_back(name);
    object->Release();
  }
  return hits;
}

}  // namespace br::brchart
