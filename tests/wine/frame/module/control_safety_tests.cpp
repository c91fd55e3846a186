// No class may say or be registered as safe for scripting or initialisation: the controls
// read local files and the registry.
#include "tests/wine/common/DllUnderTest.h"

#include "BR_Info.h"

#include <comcat.h>
#include <objsafe.h>

#include <doctest/doctest.h>

#include <string>

using br::test::DllUnderTest;

namespace {

const std::pair<const char*, const CLSID*> kClasses[] = {
      {"XObjectInspector", &CLSID_XObjectInspector}, {"TidesDatabase", &CLSID_TidesDatabase},
      {"TidesPort", &CLSID_TidesPort},               {"TidesPortList", &CLSID_TidesPortList},
      {"TidesWindow", &CLSID_TidesWindow},           {"XChartLegend", &CLSID_XChartLegend},
      {"XContoursView", &CLSID_XContoursView},       {"XPICREPView", &CLSID_XPICREPView}};

std::wstring Text(const GUID& id) {
  wchar_t text[40] = {};
  StringFromGUID2(id, text, 40);
  return text;
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

TEST_CASE("registered classes carry no safety category") {
  DllUnderTest dll;
  REQUIRE(dll.RegisterServer() == S_OK);
  int registered = 0;
  for (const auto& [name, clsid] : kClasses) {
    INFO(name);
    // Every class the DLL makes is registered, so the absence of its categories counts.
    IUnknown* object = nullptr;
    if (dll.Create(*clsid, IID_IUnknown, reinterpret_cast<void**>(&object)) == S_OK) {
      object->Release();
      HKEY classKey = nullptr;
      CHECK(RegOpenKeyExW(HKEY_CLASSES_ROOT, (L"CLSID\\" + Text(*clsid)).c_str(), 0, KEY_READ, &classKey) ==
            ERROR_SUCCESS);
      if (classKey) {
        ++registered;
        RegCloseKey(classKey);
      }
    }
    for (const wchar_t* kind : {L"Implemented Categories", L"Required Categories"}) {
      for (const CATID* category : {&CATID_SafeForScripting, &CATID_SafeForInitializing}) {
        const std::wstring path = L"CLSID\\" + Text(*clsid) + L"\\" + kind + L"\\" + Text(*category);
        HKEY key = nullptr;
        CHECK(RegOpenKeyExW(HKEY_CLASSES_ROOT, path.c_str(), 0, KEY_READ, &key) == ERROR_FILE_NOT_FOUND);
        if (key) RegCloseKey(key);
      }
    }
  }
  CHECK(registered >= 5);  // the tide classes, the legend and the contours view at least
  HKEY tidesWindow = nullptr;  // the probe reads where the registration wrote
  CHECK(RegOpenKeyExW(HKEY_CLASSES_ROOT, (L"CLSID\\" + Text(CLSID_TidesWindow)).c_str(), 0, KEY_READ, &tidesWindow) ==
        ERROR_SUCCESS);
  if (tidesWindow) RegCloseKey(tidesWindow);
  CHECK(dll.CanUnloadNow() == S_OK);
}
