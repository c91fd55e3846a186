#pragma once
// The creatable classes of the stand-in host and their registration.

#include <windows.h>

#include <string>

#include "host/chartscene/server/SceneClassFactory.h"

namespace br::chartscene {

struct SceneClass {
  const CLSID* clsid;
  const wchar_t* progId;       // "ChartScene.<Name>"
  const wchar_t* description;
  SceneCreateFunction create;
};

// The table, ended by a row with a null clsid.
const SceneClass* SceneClasses();

HRESULT RegisterSceneClasses(const std::wstring& modulePath);
HRESULT UnregisterSceneClasses();

}  // namespace br::chartscene
