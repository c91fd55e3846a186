// Entry points of chartscene.dll, the stand-in chart host: the four COM exports and, for
// tests written in C or C++, its counters and injected faults (scene_counters.h).
#include <windows.h>

#include "host/chartscene/model/scene_counters.h"
#include "host/chartscene/model/scene_misanswers.h"
#include "host/chartscene/server/SceneClassFactory.h"
#include "host/chartscene/server/SceneModule.h"
#include "host/chartscene/server/scene_classes.h"

using namespace br::chartscene;

extern "C" BOOL WINAPI DllMain(HINSTANCE instance, DWORD reason, LPVOID) {
  if (reason == DLL_PROCESS_ATTACH) {
    SceneModule::Attach(instance);
    DisableThreadLibraryCalls(instance);
  }
  return TRUE;
}

STDAPI DllCanUnloadNow() { return SceneModule::LockCount() == 0 ? S_OK : S_FALSE; }

STDAPI DllGetClassObject(REFCLSID clsid, REFIID iid, LPVOID* out) {
  if (out == nullptr) return E_POINTER;
  *out = nullptr;
  for (const SceneClass* row = SceneClasses(); row->clsid; ++row) {
    if (IsEqualCLSID(*row->clsid, clsid)) {
      SceneClassFactory* factory = new (std::nothrow) SceneClassFactory(row->create);
      if (factory == nullptr) return E_OUTOFMEMORY;
      const HRESULT hr = factory->QueryInterface(iid, out);
      factory->Release();
      return hr;
    }
  }
  return CLASS_E_CLASSNOTAVAILABLE;
}

STDAPI DllRegisterServer() {
  try {
    return RegisterSceneClasses(SceneModule::FilePath());
  } catch (...) {
    return E_OUTOFMEMORY;
  }
}

STDAPI DllUnregisterServer() {
  try {
    return UnregisterSceneClasses();
  } catch (...) {
    return E_OUTOFMEMORY;
  }
}

// A counter's value (0 for one never touched).
extern "C" long WINAPI ChartSceneCounter(const char* name) {
  return name != nullptr ? CounterValue(name) : 0;
}

// Makes an operation ("IGeoDatabase.GetName") return result from now on; 0 removes it.
extern "C" void WINAPI ChartSceneSetFault(const char* operation, HRESULT result) {
  if (operation != nullptr) SetFault(operation, static_cast<std::uint32_t>(result));
}

extern "C" void WINAPI ChartSceneClearFaults() { ClearFaults(); }

// Makes an operation answer S_OK wrongly from now on (kind: scene_misanswers.h's
// Misanswer, 1 to 5); 0 removes it. ChartSceneClearFaults removes them all.
extern "C" void WINAPI ChartSceneSetMisanswer(const char* operation, int kind) {
  if (operation != nullptr && kind >= 0 && kind <= kMisanswerKinds) SetMisanswer(operation, static_cast<Misanswer>(kind));
}
