// Class objects and instance creation.
//
// A ClassFactory is made with one reference, the class table's cache. That reference does
// not keep the module loaded: a client reference raising the count from 1 to 2 takes one
// module lock and the count falling back to 1 gives it back.
#pragma once

#include "frame/com/guard.h"

#include <unknwn.h>

#include <new>

namespace br::com {

// CreateInstance of one class: (outer, iid, out).
using CreateInstanceFunction = HRESULT (*)(IUnknown* outer, REFIID riid, void** out);

class ClassFactory final : public IClassFactory {
public:
  // A new class object holding one reference (the cache's).
  static HRESULT Create(CreateInstanceFunction create, IClassFactory** out) noexcept;

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override;
  STDMETHODIMP_(ULONG) Release() override;
  STDMETHODIMP CreateInstance(IUnknown* outer, REFIID riid, void** out) override;
  STDMETHODIMP LockServer(BOOL lock) override;

private:
  explicit ClassFactory(CreateInstanceFunction create) noexcept : create_(create) {}
  ~ClassFactory() = default;

  volatile LONG refs_ = 1;
  CreateInstanceFunction create_;
};

// A new object of class T with one reference for the caller, its FinalConstruct run.
// Allocation failure gives E_OUTOFMEMORY; a failed FinalConstruct destroys the object.
template <class T>
HRESULT NewObject(T** out) noexcept {
  if (!out) return E_POINTER;
  *out = nullptr;
  T* object = nullptr;
  try {
    object = new T();
  } catch (const std::bad_alloc&) {
    return E_OUTOFMEMORY;
  } catch (...) {
    return E_FAIL;
  }
  object->AddRef();
  const HRESULT hr = Guarded(T::kClass, [&] { return object->FinalConstruct(); });
  if (FAILED(hr)) {
    object->Release();
    return hr;
  }
  *out = object;
  return S_OK;
}

// The CreateInstanceFunction of class T: no aggregation, then NewObject and the interface.
template <class T>
HRESULT CreateInstance(IUnknown* outer, REFIID riid, void** out) noexcept {
  if (!out) return E_POINTER;
  *out = nullptr;
  if (outer) return CLASS_E_NOAGGREGATION;
  T* object = nullptr;
  HRESULT hr = NewObject(&object);
  if (FAILED(hr)) return hr;
  hr = object->QueryInterface(riid, out);
  object->Release();  // destroys the object when the interface was refused
  return hr;
}

}  // namespace br::com
