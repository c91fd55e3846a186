// The four exported entry points and DllMain of BR_Info.dll.
#include "frame/com/Module.h"
#include "frame/com/TypeLibrary.h"
#include "frame/geo/GeodesyLibrary.h"
#include "frame/module/class_rows.h"
#include "frame/module/registration.h"
#include "frame/settings/localised_texts.h"
#include "tides/objects/TidesDatabase.h"
#include "toolkit/access/ComponentAccessible.h"
#include "toolkit/core/ToolkitWindows.h"
#include "toolkit/widgets/Tooltip.h"

#include "BR_Info.h"

using br::com::Module;
using br::module::TheClassTable;

extern "C" BOOL WINAPI DllMain(HINSTANCE instance, DWORD reason, LPVOID reserved) {
  switch (reason) {
    case DLL_PROCESS_ATTACH:
      Module::Attach(instance);
      TheClassTable();  // the table and its critical section exist before any entry point runs
      DisableThreadLibraryCalls(instance);
      break;
    case DLL_PROCESS_DETACH:
      TheClassTable().ReleaseClassObjects();
      br::tides::TidesDatabase::CloseStationFiles();
      br::DropLocaliserAtDetach();
      // At process exit other DLLs may be gone already: let the cached type library go
      // only when the library itself is being unloaded.
      if (!reserved) {
        br::com::TypeLibrary::Unload();
        // Window classes and the tooltip timer would otherwise point into unloaded code.
        toolkit::Tooltip::shutdown();
        toolkit::ToolkitWindows::unregisterClasses();
      }
      break;
    default:
      break;
  }
  return TRUE;
}

// Accessibility clients may hold the toolkit's objects after their controls are gone.
// Letting the library go is the one moment the text component and the geodesy library
// can be released properly: at process detach the loader lock forbids calling into other
// DLLs, so there both are only forgotten.
STDAPI DllCanUnloadNow() {
  if (Module::LockCount() != 0 || toolkit::ComponentAccessible::liveObjects() != 0) return S_FALSE;
  br::DestroyLocaliserAtUnload();
  br::geo::GeodesyLibrary::ReleaseShared();
  return S_OK;
}

STDAPI DllGetClassObject(REFCLSID clsid, REFIID riid, LPVOID* out) {
  return TheClassTable().GetClassObject(clsid, riid, out);
}

STDAPI DllRegisterServer() {
  try {
    const std::wstring path = Module::FilePath();
    HRESULT hr = TheClassTable().RegisterClasses(path, LIBID_BR_INFOLib);
    if (SUCCEEDED(hr)) hr = br::module::RegisterTypeLibrary(path);
    return hr;
  } catch (...) {
    return E_OUTOFMEMORY;
  }
}

STDAPI DllUnregisterServer() {
  try {
    const std::wstring path = Module::FilePath();
    HRESULT hr = TheClassTable().UnregisterClasses();
    if (SUCCEEDED(hr)) hr = br::module::UnregisterTypeLibrary(path);
    return hr;
  } catch (...) {
    return E_OUTOFMEMORY;
  }
}
