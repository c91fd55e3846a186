#include "frame/com/TypeLibrary.h"

#include "frame/com/Module.h"

#include <oleauto.h>

#include <string>
#include <utility>
#include <vector>

namespace br::com {
namespace {

SRWLOCK gLock = SRWLOCK_INIT;
ITypeLib* gLibrary = nullptr;
std::vector<std::pair<GUID, ITypeInfo*>>* gInfos = nullptr;  // allocated on first use

// Caller holds gLock exclusively.
HRESULT LoadLocked() noexcept {
  if (gLibrary) return S_OK;
  try {
    const std::wstring path = Module::FilePath();
    if (path.empty()) return HRESULT_FROM_WIN32(GetLastError());
    return LoadTypeLibEx(path.c_str(), REGKIND_NONE, &gLibrary);
  } catch (...) {
    return E_OUTOFMEMORY;
  }
}

}  // namespace

HRESULT TypeLibrary::Get(ITypeLib** out) noexcept {
  if (!out) return E_POINTER;
  *out = nullptr;
  AcquireSRWLockExclusive(&gLock);
  const HRESULT hr = LoadLocked();
  if (SUCCEEDED(hr)) {
    *out = gLibrary;
    gLibrary->AddRef();
  }
  ReleaseSRWLockExclusive(&gLock);
  return hr;
}

HRESULT TypeLibrary::TypeInfoOf(REFGUID guid, ITypeInfo** out) noexcept {
  if (!out) return E_POINTER;
  *out = nullptr;
  AcquireSRWLockExclusive(&gLock);
  HRESULT hr = LoadLocked();
  if (SUCCEEDED(hr) && gInfos) {
    for (const auto& entry : *gInfos) {
      if (IsEqualGUID(entry.first, guid)) {
        *out = entry.second;
        (*out)->AddRef();
        ReleaseSRWLockExclusive(&gLock);
        return S_OK;
      }
    }
  }
  if (SUCCEEDED(hr)) {
    ITypeInfo* info = nullptr;
    hr = gLibrary->GetTypeInfoOfGuid(guid, &info);
    if (SUCCEEDED(hr)) {
      try {
        if (!gInfos) gInfos = new std::vector<std::pair<GUID, ITypeInfo*>>();
        gInfos->emplace_back(guid, info);
        info->AddRef();  // the cache's reference
      } catch (...) {
        // Not cached: the caller still gets its reference.
      }
      *out = info;
    }
  }
  ReleaseSRWLockExclusive(&gLock);
  return hr;
}

void TypeLibrary::Unload() noexcept {
  AcquireSRWLockExclusive(&gLock);
  if (gInfos) {
    for (auto& entry : *gInfos) entry.second->Release();
    delete gInfos;
    gInfos = nullptr;
  }
  if (gLibrary) {
    gLibrary->Release();
    gLibrary = nullptr;
  }
  ReleaseSRWLockExclusive(&gLock);
}

}  // namespace br::com
