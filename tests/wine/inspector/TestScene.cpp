#include "tests/wine/inspector/TestScene.h"

#include <doctest/doctest.h>

#include <cstring>

namespace br::test {

namespace {

VARIANT Text(const std::wstring& text) {
  VARIANT v;
  v.vt = VT_BSTR;
  v.bstrVal = SysAllocString(text.c_str());
  return v;
}

}  // namespace

// ---- the scene

TestScene::TestScene(const std::string& json) {
  wchar_t folder[MAX_PATH] = {};
  GetTempPathW(MAX_PATH, folder);
  static unsigned counter = 0;
  path_ = std::wstring(folder) + L"inspector_scene_" + std::to_wstring(GetCurrentProcessId()) + L"_" +
          std::to_wstring(++counter) + L".json";
  HANDLE file = CreateFileW(path_.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, FILE_ATTRIBUTE_NORMAL, nullptr);
  REQUIRE(file != INVALID_HANDLE_VALUE);
  DWORD written = 0;
  WriteFile(file, json.data(), static_cast<DWORD>(json.size()), &written, nullptr);
  CloseHandle(file);
  REQUIRE(written == json.size());
  CLSID clsid{};
  REQUIRE(CLSIDFromProgID(L"ChartScene.Scene", &clsid) == S_OK);
  REQUIRE(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch, scene_.OutVoid()) == S_OK);
  VARIANT path = Text(path_);
  VARIANT result = Call(L"Load", &path);
  VariantClear(&path);
  VariantClear(&result);
}

TestScene::~TestScene() {
  scene_.Reset();
  DeleteFileW(path_.c_str());
}

VARIANT TestScene::Call(const wchar_t* method, VARIANT* argument) {
  DISPID id = 0;
  LPOLESTR names[] = {const_cast<LPOLESTR>(method)};
  REQUIRE(scene_->GetIDsOfNames(IID_NULL, names, 1, LOCALE_USER_DEFAULT, &id) == S_OK);
  DISPPARAMS parameters{argument, nullptr, 1, 0};
  VARIANT result;
  VariantInit(&result);
  EXCEPINFO failure{};
  const HRESULT hr =
      scene_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &parameters, &result, &failure, nullptr);
  if (hr != S_OK && failure.bstrDescription)
    MESSAGE(std::string(failure.bstrDescription, failure.bstrDescription + SysStringLen(failure.bstrDescription)));
  SysFreeString(failure.bstrDescription);
  SysFreeString(failure.bstrSource);
  SysFreeString(failure.bstrHelpFile);
  REQUIRE(hr == S_OK);
  return result;
}

VARIANT TestScene::Records(const wchar_t* names) {
  VARIANT argument = Text(names);
  VARIANT result = Call(L"ObjectRecords", &argument);
  VariantClear(&argument);
  REQUIRE(result.vt == (VT_ARRAY | VT_UI1));
  return result;
}

std::vector<unsigned char> TestScene::RecordBytes(const wchar_t* names) {
  VARIANT records = Records(names);
  std::vector<unsigned char> bytes(records.parray->rgsabound[0].cElements);
  std::memcpy(bytes.data(), records.parray->pvData, bytes.size());
  VariantClear(&records);
  return bytes;
}

ComRef<IUnknown> TestScene::Database(const wchar_t* name) {
  VARIANT argument = Text(name);
  VARIANT result = Call(L"Database", &argument);
  VariantClear(&argument);
  REQUIRE(result.vt == VT_UNKNOWN);
  return ComRef<IUnknown>::Adopt(result.punkVal);
}

ComRef<IUnknown> TestScene::Object(const wchar_t* name) {
  VARIANT argument = Text(name);
  VARIANT result = Call(L"Object", &argument);
  VariantClear(&argument);
  REQUIRE(result.vt == VT_UNKNOWN);
  return ComRef<IUnknown>::Adopt(result.punkVal);
}

std::wstring TestScene::ObjectId(const wchar_t* name) {
  ComRef<IUnknown> object = Object(name);
  VARIANT argument;
  argument.vt = VT_UNKNOWN;
  argument.punkVal = object.Get();
  VARIANT result = Call(L"ObjectId", &argument);
  REQUIRE(result.vt == VT_BSTR);
  std::wstring text(result.bstrVal, SysStringLen(result.bstrVal));
  VariantClear(&result);
  return text;
}

std::wstring DataSetIdText(const std::wstring& objectId) {
  std::wstring text = objectId;
  // "{XXXXXXXX-XXXX-XXXX-": the first 8 bytes are the first 16 digits.
  for (std::size_t i = 1; i < 19 && i < text.size(); ++i)
    if (text[i] != L'-') text[i] = L'0';
  return text;
}

}  // namespace br::test
