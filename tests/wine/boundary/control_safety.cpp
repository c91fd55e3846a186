// No instance may say it is safe for scripting or initialisation: the controls read local
// files and the registry.
#include "tests/wine/common/dll_under_test.h"

#include "BR_Info.h"

#include <objsafe.h>

#include <doctest/doctest.h>

using br::test::DllUnderTest;

TEST_CASE("no instance answers IObjectSafety") {
  DllUnderTest dll;
  int created = 0;
  const std::pair<const char*, const CLSID*> classes[] = {
      {"XObjectInspector", &CLSID_XObjectInspector}, {"TidesDatabase", &CLSID_TidesDatabase},
      {"TidesPort", &CLSID_TidesPort},               {"TidesPortList", &CLSID_TidesPortList},
      {"TidesWindow", &CLSID_TidesWindow},           {"XChartLegend", &CLSID_XChartLegend},
      {"XContoursView", &CLSID_XContoursView},       {"XPICREPView", &CLSID_XPICREPView}};
  for (const auto& [name, clsid] : classes) {
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
