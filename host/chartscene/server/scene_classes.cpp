#include "host/chartscene/server/scene_classes.h"

#include <string>

#include <oleauto.h>

#include "ChartScene_h.h"
#include "GeoData.h"
#include "host/chartscene/server/ChartScene.h"
#include "host/chartscene/server/ObjectFormatter.h"
#include "host/chartscene/server/TextTable.h"

namespace br::chartscene {

namespace {

const SceneClass kClasses[] = {
    {&CLSID_ChartScene, L"ChartScene.Scene", L"Chart scene", ChartScene::Create},
    {&CLSID_ObjectFormatter, L"ChartScene.ObjectFormatter", L"Chart scene object formatter", ObjectFormatter::Create},
    {&CLSID_TextTable, L"ChartScene.TextTable", L"Chart scene text table", TextTable::Create},
    {nullptr, nullptr, nullptr, nullptr},
};

std::wstring GuidText(REFGUID guid) {
  wchar_t text[40] = {};
  StringFromGUID2(guid, text, 40);
  return text;
}

LONG SetText(HKEY root, const std::wstring& key, const wchar_t* name, const std::wstring& value) {
  HKEY opened = nullptr;
  LONG status = RegCreateKeyExW(root, key.c_str(), 0, nullptr, 0, KEY_WRITE, nullptr, &opened, nullptr);
  if (status != ERROR_SUCCESS) return status;
  status = RegSetValueExW(opened, name, 0, REG_SZ, reinterpret_cast<const BYTE*>(value.c_str()),
                          static_cast<DWORD>((value.size() + 1) * sizeof(wchar_t)));
  RegCloseKey(opened);
  return status;
}

}  // namespace

const SceneClass* SceneClasses() { return kClasses; }

HRESULT RegisterSceneClasses(const std::wstring& modulePath) {
  for (const SceneClass* row = kClasses; row->clsid; ++row) {
    const std::wstring clsid = GuidText(*row->clsid);
    const std::wstring classKey = L"CLSID\\" + clsid;
    LONG status = SetText(HKEY_CLASSES_ROOT, classKey, nullptr, row->description);
    if (status == ERROR_SUCCESS) status = SetText(HKEY_CLASSES_ROOT, classKey + L"\\InprocServer32", nullptr, modulePath);
    if (status == ERROR_SUCCESS)
      status = SetText(HKEY_CLASSES_ROOT, classKey + L"\\InprocServer32", L"ThreadingModel", L"Apartment");
    if (status == ERROR_SUCCESS) status = SetText(HKEY_CLASSES_ROOT, classKey + L"\\ProgID", nullptr, row->progId);
    if (status == ERROR_SUCCESS) status = SetText(HKEY_CLASSES_ROOT, row->progId, nullptr, row->description);
    if (status == ERROR_SUCCESS) status = SetText(HKEY_CLASSES_ROOT, std::wstring(row->progId) + L"\\CLSID", nullptr, clsid);
    if (status != ERROR_SUCCESS) return HRESULT_FROM_WIN32(status);
  }
  // The scriptable class's type library, from the module itself.
  ITypeLib* library = nullptr;
  const HRESULT hr = LoadTypeLibEx(modulePath.c_str(), REGKIND_REGISTER, &library);
  if (library) library->Release();
  return hr;
}

HRESULT UnregisterSceneClasses() {
  for (const SceneClass* row = kClasses; row->clsid; ++row) {
    RegDeleteTreeW(HKEY_CLASSES_ROOT, (L"CLSID\\" + GuidText(*row->clsid)).c_str());
    RegDeleteTreeW(HKEY_CLASSES_ROOT, row->progId);
  }
  UnRegisterTypeLib(LIBID_ChartSceneLib, 1, 0, LOCALE_NEUTRAL, sizeof(void*) == 8 ? SYS_WIN64 : SYS_WIN32);
  return S_OK;
}

}  // namespace br::chartscene
