#pragma once
// The benchmarks' way in: a registered BR_Info.TidesDatabase opened on a folder.

#include "BR_Info.h"

#include <windows.h>

namespace br::bench {

// The opened database (one reference for the caller), or null with why in failure.
inline ITidesDatabase* OpenTidesDatabase(const wchar_t* folder, const char*& failure) {
  CLSID clsid{};
  ITidesDatabase* database = nullptr;
  if (FAILED(CLSIDFromProgID(L"BR_Info.TidesDatabase", &clsid)) ||
      FAILED(CoCreateInstance(clsid, nullptr, CLSCTX_INPROC_SERVER, IID_ITidesDatabase,
                              reinterpret_cast<void**>(&database)))) {
    failure = "BR_Info.TidesDatabase cannot be made (is BR_Info.dll registered?)";
    return nullptr;
  }
  BSTR name = SysAllocString(folder);
  const HRESULT opened = database->Initialize(name);
  SysFreeString(name);
  if (FAILED(opened)) {
    database->Release();
    failure = "the folder cannot be opened";
    return nullptr;
  }
  return database;
}

}  // namespace br::bench
