#include "tests/wine/common/ScratchScene.h"

#include "tests/wine/common/SceneClient.h"

#include <doctest/doctest.h>

#include <cstring>

using Microsoft::WRL::ComPtr;

namespace br::test {

ScratchScene::ScratchScene(const std::string& json) {
  wchar_t folder[MAX_PATH] = {};
  wchar_t file[MAX_PATH] = {};
  REQUIRE(GetTempPathW(MAX_PATH, folder) > 0);
  REQUIRE(GetTempFileNameW(folder, L"scn", 0, file) != 0);
  file_ = file;
  HANDLE handle = CreateFileW(file, GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr);
  REQUIRE(handle != INVALID_HANDLE_VALUE);
  DWORD written = 0;
  WriteFile(handle, json.data(), static_cast<DWORD>(json.size()), &written, nullptr);
  CloseHandle(handle);
  REQUIRE(written == json.size());
  Load(file_);
}

ScratchScene::ScratchScene(SampleHarbour) { Load(SceneClient::SamplePath()); }

void ScratchScene::Load(const std::wstring& file) {
  CLSID clsid{};
  REQUIRE(CLSIDFromProgID(L"ChartScene.Scene", &clsid) == S_OK);
  REQUIRE(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_IDispatch,
                           reinterpret_cast<void**>(scene_.GetAddressOf())) == S_OK);
  DISPID id = 0;
  LPOLESTR name = const_cast<LPOLESTR>(L"Load");
  REQUIRE(scene_->GetIDsOfNames(IID_NULL, &name, 1, LOCALE_USER_DEFAULT, &id) == S_OK);
  VARIANT argument;
  VariantInit(&argument);
  argument.vt = VT_BSTR;
  argument.bstrVal = SysAllocString(file.c_str());
  DISPPARAMS params{&argument, nullptr, 1, 0};
  EXCEPINFO exception{};
  const HRESULT loaded = scene_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &params, nullptr,
                                        &exception, nullptr);
  VariantClear(&argument);
  std::string why;
  for (const wchar_t* c = exception.bstrDescription; c && *c; ++c) why += static_cast<char>(*c);
  SysFreeString(exception.bstrDescription);
  SysFreeString(exception.bstrSource);
  SysFreeString(exception.bstrHelpFile);
  REQUIRE_MESSAGE(loaded == S_OK, why);
}

ScratchScene::~ScratchScene() {
  scene_.Reset();
  if (!file_.empty()) DeleteFileW(file_.c_str());
}

std::wstring ScratchScene::FormatterOption(long id) const {
  VARIANT out = CallValue(L"FormatterOption", std::to_wstring(id).c_str());
  std::wstring text = out.vt == VT_BSTR && out.bstrVal ? std::wstring(out.bstrVal, SysStringLen(out.bstrVal)) : L"";
  VariantClear(&out);
  return text;
}

VARIANT ScratchScene::CallValue(const wchar_t* method, const wchar_t* argument) const {
  DISPID id = 0;
  LPOLESTR name = const_cast<LPOLESTR>(method);
  REQUIRE(scene_->GetIDsOfNames(IID_NULL, &name, 1, LOCALE_USER_DEFAULT, &id) == S_OK);
  VARIANT in;
  VariantInit(&in);
  in.vt = VT_BSTR;
  in.bstrVal = SysAllocString(argument);
  VARIANT out;
  VariantInit(&out);
  DISPPARAMS params{&in, nullptr, 1, 0};
  const HRESULT hr = scene_->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, &params, &out, nullptr,
                                    nullptr);
  VariantClear(&in);
  if (hr != S_OK) VariantClear(&out);
  return out;
}

ComPtr<IUnknown> ScratchScene::Call(const wchar_t* method, const wchar_t* argument) const {
  VARIANT out = CallValue(method, argument);
  ComPtr<IUnknown> result;
  if ((out.vt == VT_UNKNOWN || out.vt == VT_DISPATCH) && out.punkVal) result = out.punkVal;
  VariantClear(&out);
  return result;
}

VARIANT ScratchScene::Records(const wchar_t* names) const {
  VARIANT records = CallValue(L"ObjectRecords", names);
  REQUIRE(records.vt == (VT_ARRAY | VT_UI1));
  return records;
}

ComPtr<IGeoObject> ScratchScene::Object(const wchar_t* name) const {
  ComPtr<IGeoObject> object;
  ComPtr<IUnknown> unknown = Call(L"Object", name);
  REQUIRE(unknown);
  REQUIRE(unknown.As(&object) == S_OK);
  return object;
}

ComPtr<IGeoDatabase> ScratchScene::Database(const wchar_t* name) const {
  ComPtr<IGeoDatabase> database;
  ComPtr<IUnknown> unknown = Call(L"Database", name);
  REQUIRE(unknown);
  REQUIRE(unknown.As(&database) == S_OK);
  return database;
}

ComPtr<IUnknown> ScratchScene::DataSet(const wchar_t* id) const {
  ComPtr<IUnknown> unknown = Call(L"DataSet", id);
  REQUIRE(unknown);
  return unknown;
}

GUID ScratchScene::DataSetIdentity(const char* id) {
  GUID identity{};
  auto* bytes = reinterpret_cast<unsigned char*>(&identity);
  for (int i = 0; i < 8; ++i) bytes[8 + i] = '.';
  for (int i = 0; i < 8 && id[i] != '\0'; ++i) bytes[8 + i] = static_cast<unsigned char>(id[i]);
  return identity;
}

GUID ScratchScene::IdOf(IGeoObject* object) {
  GUID id{};
  REQUIRE(object->GetId(&id) == S_OK);
  return id;
}

}  // namespace br::test
