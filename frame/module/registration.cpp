#include "frame/module/registration.h"

#include <oleauto.h>

#include <cwchar>
#include <new>

namespace br::module {
namespace {

// One key under HKEY_CLASSES_ROOT with its default value (nullptr: none) and, optionally,
// one named value.
HRESULT WriteKey(const std::wstring& path, const wchar_t* defaultValue, const wchar_t* valueName = nullptr,
                 const wchar_t* value = nullptr) {
  HKEY key = nullptr;
  LONG rc = RegCreateKeyExW(HKEY_CLASSES_ROOT, path.c_str(), 0, nullptr, REG_OPTION_NON_VOLATILE, KEY_WRITE,
                            nullptr, &key, nullptr);
  if (rc != ERROR_SUCCESS) return HRESULT_FROM_WIN32(rc);
  auto set = [key](const wchar_t* name, const wchar_t* text) {
    const DWORD bytes = static_cast<DWORD>((wcslen(text) + 1) * sizeof(wchar_t));
    return RegSetValueExW(key, name, 0, REG_SZ, reinterpret_cast<const BYTE*>(text), bytes);
  };
  if (defaultValue) rc = set(nullptr, defaultValue);
  if (rc == ERROR_SUCCESS && valueName) rc = set(valueName, value);
  RegCloseKey(key);
  return HRESULT_FROM_WIN32(rc);
}

HRESULT RemoveTree(const std::wstring& path) {
  const LONG rc = RegDeleteTreeW(HKEY_CLASSES_ROOT, path.c_str());
  if (rc == ERROR_SUCCESS || rc == ERROR_FILE_NOT_FOUND || rc == ERROR_PATH_NOT_FOUND) {
    RegDeleteKeyW(HKEY_CLASSES_ROOT, path.c_str());  // the key itself, left by RegDeleteTree
    return S_OK;
  }
  return HRESULT_FROM_WIN32(rc);
}

HRESULT WriteAll(const ClassEntry& row, const std::wstring& modulePath, const GUID& libid) {
  const bool control = row.kind == ClassKind::Control;
  const std::wstring title = std::wstring(row.name) + L" Class";
  const std::wstring progId = std::wstring(L"BR_Info.") + row.name;
  const std::wstring progId1 = progId + L".1";
  const std::wstring clsid = GuidText(*row.clsid);
  const std::wstring classKey = L"CLSID\\" + clsid;

  HRESULT hr = S_OK;
  auto write = [&hr](const std::wstring& path, const wchar_t* text, const wchar_t* name = nullptr,
                     const wchar_t* value = nullptr) {
    if (SUCCEEDED(hr)) hr = WriteKey(path, text, name, value);
  };
  write(progId1, title.c_str());
  write(progId1 + L"\\CLSID", clsid.c_str());
  if (control) write(progId1 + L"\\Insertable", nullptr);
  write(progId, title.c_str());
  write(progId + L"\\CLSID", clsid.c_str());
  write(progId + L"\\CurVer", progId1.c_str());

  if (SUCCEEDED(hr)) hr = RemoveTree(classKey);  // the class key is replaced whole
  write(classKey, title.c_str());
  write(classKey + L"\\ProgID", progId1.c_str());
  write(classKey + L"\\VersionIndependentProgID", progId.c_str());
  write(classKey + L"\\Programmable", nullptr);
  write(classKey + L"\\InprocServer32", modulePath.c_str(), L"ThreadingModel", L"Apartment");
  if (control) {
    const std::wstring bitmap = modulePath + L", " + std::to_wstring(row.toolboxBitmap);
    write(classKey + L"\\Control", nullptr);
    write(classKey + L"\\Insertable", nullptr);
    write(classKey + L"\\ToolboxBitmap32", bitmap.c_str());
    write(classKey + L"\\MiscStatus", L"0");
    write(classKey + L"\\MiscStatus\\1", L"131473");
  }
  write(classKey + L"\\TypeLib", GuidText(libid).c_str());
  if (control) write(classKey + L"\\Version", L"1.0");
  return hr;
}

}  // namespace

std::wstring GuidText(const GUID& guid) {
  wchar_t text[40] = {};
  StringFromGUID2(guid, text, 40);
  return text;
}

HRESULT WriteClassKeys(const ClassEntry& row, const std::wstring& modulePath, const GUID& libid) noexcept {
  try {
    return WriteAll(row, modulePath, libid);
  } catch (const std::bad_alloc&) {
    return E_OUTOFMEMORY;
  } catch (...) {
    return E_FAIL;
  }
}

HRESULT RemoveClassKeys(const ClassEntry& row) noexcept {
  try {
    const std::wstring progId = std::wstring(L"BR_Info.") + row.name;
    HRESULT hr = RemoveTree(progId + L".1");
    if (SUCCEEDED(hr)) hr = RemoveTree(progId);
    if (SUCCEEDED(hr)) hr = RemoveTree(L"CLSID\\" + GuidText(*row.clsid));
    return hr;
  } catch (const std::bad_alloc&) {
    return E_OUTOFMEMORY;
  } catch (...) {
    return E_FAIL;
  }
}

HRESULT RegisterTypeLibrary(const std::wstring& modulePath) noexcept {
  ITypeLib* library = nullptr;
  HRESULT hr = LoadTypeLibEx(modulePath.c_str(), REGKIND_NONE, &library);
  if (FAILED(hr)) return hr;
  try {
    // Registered under the module's own path (REGKIND_REGISTER would let the loader pick
    // the spelling of the path), with the module's folder as the help folder.
    std::wstring folder = modulePath;
    const std::size_t cut = folder.find_last_of(L"\\/");
    folder.resize(cut == std::wstring::npos ? 0 : cut);
    hr = RegisterTypeLib(library, const_cast<LPOLESTR>(modulePath.c_str()),
                         folder.empty() ? nullptr : const_cast<LPOLESTR>(folder.c_str()));
  } catch (...) {
    hr = E_OUTOFMEMORY;
  }
  library->Release();
  return hr;
}

HRESULT UnregisterTypeLibrary(const std::wstring& modulePath) noexcept {
  ITypeLib* library = nullptr;
  HRESULT hr = LoadTypeLibEx(modulePath.c_str(), REGKIND_NONE, &library);
  if (FAILED(hr)) return hr;
  TLIBATTR* attributes = nullptr;
  hr = library->GetLibAttr(&attributes);
  if (SUCCEEDED(hr)) {
    // A type library that is not registered (any more) is no failure of unregistration.
    wchar_t version[32];
    swprintf(version, 32, L"\\%x.%x", attributes->wMajorVerNum, attributes->wMinorVerNum);
    const std::wstring key = L"TypeLib\\" + GuidText(attributes->guid) + version;
    HKEY opened = nullptr;
    if (RegOpenKeyExW(HKEY_CLASSES_ROOT, key.c_str(), 0, KEY_READ, &opened) == ERROR_SUCCESS) {
      RegCloseKey(opened);
      hr = UnRegisterTypeLib(attributes->guid, attributes->wMajorVerNum, attributes->wMinorVerNum,
                             attributes->lcid, attributes->syskind);
    }
    library->ReleaseTLibAttr(attributes);
  }
  library->Release();
  return hr;
}

}  // namespace br::module
