// No class may be marked safe for scripting or initialisation: the controls read local files
// and the registry.
#include "tests/wine/common/dll_under_test.h"

#include "BR_Info.h"

#include <comcat.h>
#include <objsafe.h>

#include <doctest/doctest.h>

#include <string>
#include <vector>

using br::test::DllUnderTest;

namespace {

const std::pair<const char*, const CLSID*> kClasses[] = {
    {"XObjectInspector", &CLSID_XObjectInspector}, {"TidesDatabase", &CLSID_TidesDatabase},
    {"TidesPort", &CLSID_TidesPort},               {"TidesPortList", &CLSID_TidesPortList},
    {"TidesWindow", &CLSID_TidesWindow},           {"XChartLegend", &CLSID_XChartLegend},
    {"XContoursView", &CLSID_XContoursView},       {"XPICREPView", &CLSID_XPICREPView},
};
const CATID* const kSafetyCategories[] = {&CATID_SafeForScripting, &CATID_SafeForInitializing};

std::wstring Text(const GUID& id) {
  wchar_t text[40] = {};
  StringFromGUID2(id, text, 40);
  return text;
}

// Every subkey name and string value under a key, at any depth; false if there is no key.
bool CollectTexts(HKEY parent, const std::wstring& path, std::vector<std::wstring>& out) {
  HKEY key = nullptr;
  if (RegOpenKeyExW(parent, path.c_str(), 0, KEY_READ, &key) != ERROR_SUCCESS) return false;
  wchar_t name[256];
  for (DWORD i = 0;; ++i) {
    DWORD length = 256;
    if (RegEnumKeyExW(key, i, name, &length, nullptr, nullptr, nullptr, nullptr) != ERROR_SUCCESS) break;
    out.push_back(name);
    CollectTexts(key, name, out);
  }
  for (DWORD i = 0;; ++i) {
    DWORD nameLength = 256, type = 0;
    BYTE data[1024];
    DWORD size = sizeof data;
    if (RegEnumValueW(key, i, name, &nameLength, nullptr, &type, data, &size) != ERROR_SUCCESS) break;
    out.push_back(name);
    if (type == REG_SZ) out.push_back(reinterpret_cast<const wchar_t*>(data));
  }
  RegCloseKey(key);
  return true;
}

// A GUID's 36 characters inside any of the texts, in any case.
bool Mentions(std::vector<std::wstring> texts, const std::wstring& guid) {
  for (std::wstring& t : texts)
    if (CharUpperW(t.data()), t.find(guid.substr(1, 36)) != std::wstring::npos) return true;
  return false;
}

}  // namespace

TEST_CASE("no instance answers IObjectSafety") {
  DllUnderTest dll;
  int created = 0;
  for (const auto& [name, clsid] : kClasses) {
    INFO(name);
    IUnknown* object = nullptr;
    if (dll.Create(*clsid, IID_IUnknown, reinterpret_cast<void**>(&object)) != S_OK) continue;  // not built yet
    ++created;
    IObjectSafety* safety = reinterpret_cast<IObjectSafety*>(object);  // overwritten by the answer
    CHECK(object->QueryInterface(IID_IObjectSafety, reinterpret_cast<void**>(&safety)) == E_NOINTERFACE);
    CHECK(safety == nullptr);
    object->Release();
  }
  CHECK(created >= 2);
  CHECK(dll.CanUnloadNow() == S_OK);
}

TEST_CASE("registered classes carry no safety category at any depth of their keys") {
  DllUnderTest dll;
  REQUIRE(dll.RegisterServer() == S_OK);
  int registered = 0;
  for (const auto& [name, clsid] : kClasses) {
    INFO(name);
    std::vector<std::wstring> texts;  // covers Implemented and Required Categories
    if (!CollectTexts(HKEY_CLASSES_ROOT, L"CLSID\\" + Text(*clsid), texts)) continue;
    ++registered;
    for (const CATID* category : kSafetyCategories) CHECK_FALSE(Mentions(texts, Text(*category)));
  }
  CHECK(registered >= 2);
  CHECK(dll.CanUnloadNow() == S_OK);
}
