#include "frame/module/ClassTable.h"

#include "frame/module/registration.h"

namespace br::module {

ClassTable::ClassTable(ClassEntry* rows, std::size_t count) noexcept : rows_(rows), count_(count) {
  InitializeCriticalSection(&lock_);
}

ClassTable::~ClassTable() { DeleteCriticalSection(&lock_); }

HRESULT ClassTable::GetClassObject(REFCLSID clsid, REFIID riid, void** out) noexcept {
  if (!out) return E_POINTER;
  *out = nullptr;
  for (std::size_t i = 0; i < count_; ++i) {
    ClassEntry& row = rows_[i];
    if (!IsEqualCLSID(*row.clsid, clsid)) continue;
    HRESULT hr = S_OK;
    EnterCriticalSection(&lock_);
    if (!row.classObject) hr = br::com::ClassFactory::Create(row.createInstance, &row.classObject);
    if (SUCCEEDED(hr)) hr = row.classObject->QueryInterface(riid, out);
    LeaveCriticalSection(&lock_);
    return hr;
  }
  return CLASS_E_CLASSNOTAVAILABLE;
}

HRESULT ClassTable::RegisterClasses(const std::wstring& modulePath, const GUID& libid) noexcept {
  for (std::size_t i = 0; i < count_; ++i) {
    const HRESULT hr = WriteClassKeys(rows_[i], modulePath, libid);
    if (FAILED(hr)) return hr;
  }
  return S_OK;
}

HRESULT ClassTable::UnregisterClasses() noexcept {
  for (std::size_t i = 0; i < count_; ++i) {
    const HRESULT hr = RemoveClassKeys(rows_[i]);
    if (FAILED(hr)) return hr;
  }
  return S_OK;
}

void ClassTable::ReleaseClassObjects() noexcept {
  EnterCriticalSection(&lock_);
  for (std::size_t i = 0; i < count_; ++i) {
    if (IClassFactory* object = rows_[i].classObject) {
      rows_[i].classObject = nullptr;
      object->Release();
    }
  }
  LeaveCriticalSection(&lock_);
}

}  // namespace br::module
