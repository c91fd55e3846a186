// Base of every automation class: reference counting with one module lock per live
// object, QueryInterface from the class's interface table, IDispatch served by the type
// library, and the companion faces (connection points, class info, error info).
//
// A class derives from DispatchObject<Class, IClass> (IClass: its dual interface) and
// declares
//   static const br::com::ClassIdentity kClass;
//   static const Entry kInterfaces[];   // ends with {nullptr, nullptr}
// using the faces below; see docs/com-frame.md.
#pragma once

#include "frame/com/ClassIdentity.h"
#include "frame/com/ClassInfoProvider.h"
#include "frame/com/ConnectionPointContainer.h"
#include "frame/com/ErrorInfoSupport.h"
#include "frame/com/error_info.h"
#include "frame/com/guard.h"
#include "frame/com/Module.h"
#include "frame/com/TypeLibrary.h"

#include <oleauto.h>

namespace br::com {

// One row of an interface table: an IID and the face of the object that answers it.
template <class Derived>
struct InterfaceEntry {
  const IID* iid;
  IUnknown* (*face)(Derived& object);
};

template <class Derived, class Dual>
class DispatchObject : public Dual {
public:
  using Entry = InterfaceEntry<Derived>;

  // ---- IUnknown
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    if (!out) return E_POINTER;
    *out = nullptr;
    for (const Entry* e = Derived::kInterfaces; e->iid; ++e) {
      if (IsEqualIID(*e->iid, riid)) {
        IUnknown* face = e->face(static_cast<Derived&>(*this));
        if (!face) break;
        face->AddRef();
        *out = face;
        return S_OK;
      }
    }
    return E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return static_cast<ULONG>(InterlockedIncrement(&refs_)); }
  STDMETHODIMP_(ULONG) Release() override {
    const LONG n = InterlockedDecrement(&refs_);
    if (n == 0) delete this;
    return static_cast<ULONG>(n);
  }

  // ---- IDispatch
  STDMETHODIMP GetTypeInfoCount(UINT* count) override {
    if (!count) return E_POINTER;
    *count = 1;
    return S_OK;
  }
  STDMETHODIMP GetTypeInfo(UINT index, LCID, ITypeInfo** out) override {
    if (!out) return E_POINTER;
    *out = nullptr;
    if (index != 0) return DISP_E_BADINDEX;
    return TypeLibrary::TypeInfoOf(*Derived::kClass.dual, out);
  }
  STDMETHODIMP GetIDsOfNames(REFIID riid, LPOLESTR* names, UINT count, LCID, DISPID* ids) override {
    if (!IsEqualIID(riid, IID_NULL)) return DISP_E_UNKNOWNINTERFACE;
    ITypeInfo* info = nullptr;
    HRESULT hr = TypeLibrary::TypeInfoOf(*Derived::kClass.dual, &info);
    if (FAILED(hr)) return hr;
    hr = DispGetIDsOfNames(info, names, count, ids);
    info->Release();
    return hr;
  }
  STDMETHODIMP Invoke(DISPID id, REFIID riid, LCID, WORD flags, DISPPARAMS* params, VARIANT* result,
                      EXCEPINFO* exception, UINT* argumentError) override {
    if (!IsEqualIID(riid, IID_NULL)) return DISP_E_UNKNOWNINTERFACE;
    ITypeInfo* info = nullptr;
    HRESULT hr = TypeLibrary::TypeInfoOf(*Derived::kClass.dual, &info);
    if (FAILED(hr)) return hr;
    hr = info->Invoke(static_cast<Dual*>(this), id, flags, params, result, exception, argumentError);
    info->Release();
    return hr;
  }

  // The class's own initialisation after construction; a failure destroys the object.
  virtual HRESULT FinalConstruct() { return S_OK; }

protected:
  DispatchObject()
      : connectionPoints_(*this, Derived::kClass.events),
        classInfo_(*this, Derived::kClass),
        errorInfo_(*this, Derived::kClass) {}
  virtual ~DispatchObject() = default;

  // Faces for the interface table.
  static IUnknown* Self(Derived& o) { return static_cast<Dual*>(&o); }
  static IUnknown* ConnectionPoints(Derived& o) { return &o.connectionPoints_; }
  static IUnknown* ClassInfo(Derived& o) { return &o.classInfo_; }
  static IUnknown* ErrorInfo(Derived& o) { return &o.errorInfo_; }

  // Fires an event of the class's source interface to every connected sink.
  void FireEvent(DISPID id, DISPPARAMS* params = nullptr) noexcept {
    if (ConnectionPoint* point = connectionPoints_.Point()) point->Fire(id, params);
  }

  // The method boundary: see guard.h.
  template <class Body>
  static HRESULT Guard(Body&& body) noexcept {
    return Guarded(Derived::kClass, static_cast<Body&&>(body));
  }
  // Fails with hr and a description for the client.
  static HRESULT Error(HRESULT hr, const wchar_t* description) noexcept {
    try {
      return ReportErrorInfo(Derived::kClass, hr, description);
    } catch (...) {
      return hr;
    }
  }

private:
  volatile LONG refs_ = 0;
  ModuleLockHolder lock_;
  ConnectionPointContainer connectionPoints_;
  ClassInfoProvider classInfo_;
  ErrorInfoSupport errorInfo_;
};

}  // namespace br::com
