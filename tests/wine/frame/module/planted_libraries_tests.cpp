// Nothing gets in through the library and it leaves nothing behind: with copies of a probe
// DLL planted in the current folder under every name the library loads, making each class,
// hosting, painting and asking each control for its accessible object loads none of them;
// and doing so writes no registry value.
#include "tests/wine/common/AtlHost.h"
#include "tests/wine/common/DllUnderTest.h"
#include "tests/wine/common/PlantedFolder.h"

#include "BR_Info.h"

#include <oleacc.h>
#include <ole2.h>

#include <doctest/doctest.h>

#include <string>
#include <utility>
#include <vector>

using br::test::AtlHost;
using br::test::DllUnderTest;
using br::test::PlantedFolder;

namespace {

const std::pair<const char*, const CLSID*> kClasses[] = {
    {"XObjectInspector", &CLSID_XObjectInspector}, {"TidesDatabase", &CLSID_TidesDatabase},
    {"TidesPort", &CLSID_TidesPort},               {"TidesPortList", &CLSID_TidesPortList},
    {"TidesWindow", &CLSID_TidesWindow},           {"XChartLegend", &CLSID_XChartLegend},
    {"XContoursView", &CLSID_XContoursView},       {"XPICREPView", &CLSID_XPICREPView}};

// Uniscribe, rich edit, GDI+, accessibility, the ATL host and the geodesy library.
const wchar_t* const kPlantedNames[] = {L"usp10.dll",    L"riched20.dll", L"riched32.dll", L"msftedit.dll",
                                        L"gdiplus.dll",  L"oleacc.dll",   L"atl.dll",      L"atl100.dll",
                                        L"BRGBASE.dll"};

// {618736E0-3C3D-11CF-810C-00AA00389B71}: mingw's import library gives a wrong IID_IAccessible.
const IID kAccessible = {0x618736E0, 0x3C3D, 0x11CF, {0x81, 0x0C, 0x00, 0xAA, 0x00, 0x38, 0x9B, 0x71}};

void Pump() {
  MSG msg;
  for (int i = 0; i < 50 && PeekMessageW(&msg, nullptr, 0, 0, PM_REMOVE); ++i) {
    TranslateMessage(&msg);
    DispatchMessageW(&msg);
  }
}

BOOL CALLBACK AskAccessible(HWND window, LPARAM asked) {
  IUnknown* accessible = nullptr;
  if (AccessibleObjectFromWindow(window, static_cast<DWORD>(OBJID_CLIENT), kAccessible,
                                 reinterpret_cast<void**>(&accessible)) == S_OK && accessible) {
    accessible->Release();
  }
  ++*reinterpret_cast<int*>(asked);
  return TRUE;
}

// Makes every class that is built; hosts, paints and reads each control. Every control made
// must be hosted; the number hosted.
int ExerciseEveryClass(const DllUnderTest& dll, const AtlHost& atl) {
  int controls = 0;
  int hosted = 0;
  for (const auto& [name, clsid] : kClasses) {
    INFO(name);
    IUnknown* object = nullptr;
    if (dll.Create(*clsid, IID_IUnknown, reinterpret_cast<void**>(&object)) != S_OK) continue;  // not built yet
    IOleObject* control = nullptr;
    if (object->QueryInterface(IID_IOleObject, reinterpret_cast<void**>(&control)) == S_OK) {
      control->Release();
      ++controls;
      HWND host = AtlHost::MakeWindow(320, 240);
      REQUIRE(host != nullptr);
      IUnknown* site = nullptr;
      if (atl.Attach(object, host, &site) == S_OK) {
        ++hosted;
        Pump();
        RedrawWindow(host, nullptr, nullptr, RDW_INVALIDATE | RDW_UPDATENOW | RDW_ALLCHILDREN);
        int asked = 0;
        EnumChildWindows(host, AskAccessible, reinterpret_cast<LPARAM>(&asked));
        CHECK(asked > 0);
        Pump();
      }
      DestroyWindow(host);
      Pump();
      if (site) site->Release();
    }
    object->Release();
  }
  CHECK(hosted == controls);
  return hosted;
}

struct WatchedKey {
  HKEY key = nullptr;
  HANDLE changed = nullptr;
};

}  // namespace

TEST_CASE("beside DLLs planted under the names the library loads, every class is made, hosted, painted and read") {
  AtlHost atl;  // the test's own host, loaded before the folder is entered
  atl.WinInit();  // FALSE once its window class is registered
  PlantedFolder planted;
  for (const wchar_t* name : kPlantedNames) planted.Plant(name);
  {
    DllUnderTest dll;
    CHECK(ExerciseEveryClass(dll, atl) >= 5);  // the inspector, two tide controls, contours, picture view
    CHECK(dll.CanUnloadNow() == S_OK);
  }
  CHECK(planted.ModulesFromHere().empty());
  CHECK_FALSE(planted.ProbeRan());
}

TEST_CASE("making, hosting, painting and reading every class writes no registry value") {
  AtlHost atl;
  atl.WinInit();  // FALSE once its window class is registered
  const std::pair<HKEY, const wchar_t*> roots[] = {
      {HKEY_CURRENT_USER, L"Software"}, {HKEY_LOCAL_MACHINE, L"Software"}, {HKEY_CLASSES_ROOT, L"CLSID"}};
  std::vector<WatchedKey> watched;
  for (const auto& [root, path] : roots) {
    WatchedKey w;
    REQUIRE(RegOpenKeyExW(root, path, 0, KEY_NOTIFY, &w.key) == ERROR_SUCCESS);
    w.changed = CreateEventW(nullptr, TRUE, FALSE, nullptr);
    REQUIRE(RegNotifyChangeKeyValue(w.key, TRUE, REG_NOTIFY_CHANGE_NAME | REG_NOTIFY_CHANGE_LAST_SET, w.changed,
                                    TRUE) == ERROR_SUCCESS);
    watched.push_back(w);
  }
  {
    DllUnderTest dll;
    CHECK(ExerciseEveryClass(dll, atl) >= 5);  // the inspector, two tide controls, contours, picture view
    CHECK(dll.CanUnloadNow() == S_OK);
  }
  for (std::size_t i = 0; i < watched.size(); ++i) {
    INFO("root " << i);
    CHECK(WaitForSingleObject(watched[i].changed, 200) == WAIT_TIMEOUT);
    CloseHandle(watched[i].changed);
    RegCloseKey(watched[i].key);
  }
  // The watch itself works: a value written below a watched key is seen.
  HKEY probe = nullptr;
  REQUIRE(RegOpenKeyExW(HKEY_CURRENT_USER, L"Software", 0, KEY_NOTIFY, &probe) == ERROR_SUCCESS);
  HANDLE changed = CreateEventW(nullptr, TRUE, FALSE, nullptr);
  REQUIRE(RegNotifyChangeKeyValue(probe, TRUE, REG_NOTIFY_CHANGE_NAME | REG_NOTIFY_CHANGE_LAST_SET, changed, TRUE) ==
          ERROR_SUCCESS);
  HKEY scratch = nullptr;
  REQUIRE(RegCreateKeyExW(HKEY_CURRENT_USER, L"Software\\BrPlantedWatchProbe", 0, nullptr, REG_OPTION_VOLATILE,
                          KEY_ALL_ACCESS, nullptr, &scratch, nullptr) == ERROR_SUCCESS);
  RegCloseKey(scratch);
  CHECK(WaitForSingleObject(changed, 2000) == WAIT_OBJECT_0);
  RegDeleteKeyW(HKEY_CURRENT_USER, L"Software\\BrPlantedWatchProbe");
  CloseHandle(changed);
  RegCloseKey(probe);
}
