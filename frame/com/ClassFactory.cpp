#include "frame/com/ClassFactory.h"

#include "frame/com/Module.h"

namespace br::com {

HRESULT ClassFactory::Create(CreateInstanceFunction create, IClassFactory** out) noexcept {
  if (!out) return E_POINTER;
  *out = nullptr;
  if (!create) return E_INVALIDARG;
  ClassFactory* factory = new (std::nothrow) ClassFactory(create);
  if (!factory) return E_OUTOFMEMORY;
  *out = factory;
  return S_OK;
}

STDMETHODIMP ClassFactory::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IClassFactory)) {
    *out = static_cast<IClassFactory*>(this);
    AddRef();
    return S_OK;
  }
  *out = nullptr;
  return E_NOINTERFACE;
}

STDMETHODIMP_(ULONG) ClassFactory::AddRef() {
  const LONG n = InterlockedIncrement(&refs_);
  if (n == 2) Module::Lock();
  return static_cast<ULONG>(n);
}

STDMETHODIMP_(ULONG) ClassFactory::Release() {
  const LONG n = InterlockedDecrement(&refs_);
  if (n == 1) Module::Unlock();
  if (n == 0) delete this;
  return static_cast<ULONG>(n);
}

STDMETHODIMP ClassFactory::CreateInstance(IUnknown* outer, REFIID riid, void** out) {
  return create_(outer, riid, out);
}

STDMETHODIMP ClassFactory::LockServer(BOOL lock) {
  if (lock) {
    Module::Lock();
  } else {
    Module::Unlock();
  }
  return S_OK;
}

}  // namespace br::com
