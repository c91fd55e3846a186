#include "tests/wine/common/SceneClient.h"

#include <doctest/doctest.h>

#include <cstdlib>

namespace br::test {

SceneClient::SceneClient() {
  CLSID clsid{};
  REQUIRE(CLSIDFromProgID(L"ChartScene.Scene", &clsid) == S_OK);
  REQUIRE(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch, scene_.OutVoid()) == S_OK);
}

std::wstring SceneClient::SamplePath() {
  const char* root = std::getenv("BR_SOURCE_DIR");
  REQUIRE(root != nullptr);
  std::wstring path = L"Z:";
  for (const char* c = root; *c; ++c) path += *c == '/' ? L'\\' : static_cast<wchar_t>(*c);
  return path + L"\\data\\harbour\\harbour.json";
}

HRESULT SceneClient::Load(const std::wstring& path) {
  VARIANT result;
  const HRESULT hr = Call(L"Load", path.c_str(), result);
  VariantClear(&result);
  return hr;
}

std::wstring SceneClient::LastError() {
  DISPID id = 0;
  LPOLESTR names[] = {const_cast<LPOLESTR>(L"LastError")};
  REQUIRE(scene_->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &id) == S_OK);
  DISPPARAMS none{nullptr, nullptr, 0, 0};
  VARIANT result;
  VariantInit(&result);
  scene_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_PROPERTYGET, &none, &result, nullptr, nullptr);
  std::wstring text = result.vt == VT_BSTR && result.bstrVal ? result.bstrVal : L"";
  VariantClear(&result);
  return text;
}

br::com::ComRef<IUnknown> SceneClient::Component(const wchar_t* kind, const wchar_t* name) {
  VARIANT result;
  REQUIRE(Call(kind, name, result) == S_OK);
  REQUIRE(result.vt == VT_UNKNOWN);
  return br::com::ComRef<IUnknown>::Adopt(result.punkVal);
}

long SceneClient::Palette(const wchar_t* name) {
  VARIANT result;
  REQUIRE(Call(L"Palette", name, result) == S_OK);
  REQUIRE(result.vt == VT_I4);
  return result.lVal;
}

HRESULT SceneClient::Call(const wchar_t* method, const wchar_t* text, VARIANT& result) {
  VariantInit(&result);
  DISPID id = 0;
  LPOLESTR names[] = {const_cast<LPOLESTR>(method)};
  REQUIRE(scene_->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &id) == S_OK);
  VARIANT argument;
  argument.vt = VT_BSTR;
  argument.bstrVal = SysAllocString(text);
  DISPPARAMS parameters{&argument, nullptr, 1, 0};
  const HRESULT hr =
      scene_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, &result, nullptr, nullptr);
  VariantClear(&argument);
  return hr;
}

}  // namespace br::test
