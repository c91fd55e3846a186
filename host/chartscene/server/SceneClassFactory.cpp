#include "host/chartscene/server/SceneClassFactory.h"

#include "host/chartscene/server/SceneModule.h"

namespace br::chartscene {

SceneClassFactory::SceneClassFactory(SceneCreateFunction create) : create_(create) {
  SceneModule::Lock();
}

STDMETHODIMP SceneClassFactory::QueryInterface(REFIID iid, void** out) {
  if (out == nullptr) return E_POINTER;
  if (IsEqualIID(iid, IID_IUnknown) || IsEqualIID(iid, IID_IClassFactory)) {
    *out = static_cast<IClassFactory*>(this);
    AddRef();
    return S_OK;
  }
  *out = nullptr;
  return E_NOINTERFACE;
}

STDMETHODIMP_(ULONG) SceneClassFactory::AddRef() {
  SceneModule::Lock();
  return static_cast<ULONG>(InterlockedIncrement(&refs_));
}

STDMETHODIMP_(ULONG) SceneClassFactory::Release() {
  const LONG left = InterlockedDecrement(&refs_);
  SceneModule::Unlock();
  if (left == 0) delete this;
  return static_cast<ULONG>(left);
}

STDMETHODIMP SceneClassFactory::CreateInstance(IUnknown* outer, REFIID iid, void** out) {
  if (out == nullptr) return E_POINTER;
  *out = nullptr;
  if (outer != nullptr) return CLASS_E_NOAGGREGATION;
  IUnknown* object = nullptr;
  const HRESULT hr = create_(&object);
  if (FAILED(hr)) return hr;
  const HRESULT query = object->QueryInterface(iid, out);
  object->Release();
  return query;
}

STDMETHODIMP SceneClassFactory::LockServer(BOOL lock) {
  if (lock) {
    SceneModule::Lock();
  } else {
    SceneModule::Unlock();
  }
  return S_OK;
}

}  // namespace br::chartscene
