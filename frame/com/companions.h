// Faces of an object that are separate C++ objects (the frame keeps to single
// inheritance): each derives from one interface and hands IUnknown to its owner, so the
// owner's reference count and interface table govern them.
#pragma once

#include "frame/com/ClassIdentity.h"

#include <ocidl.h>

namespace br::com {

template <class Interface>
class Companion : public Interface {
public:
  explicit Companion(IUnknown& owner) noexcept : owner_(owner) {}
  Companion(const Companion&) = delete;
  Companion& operator=(const Companion&) = delete;
  virtual ~Companion() = default;

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override { return owner_.QueryInterface(riid, out); }
  STDMETHODIMP_(ULONG) AddRef() override { return owner_.AddRef(); }
  STDMETHODIMP_(ULONG) Release() override { return owner_.Release(); }

protected:
  IUnknown& Owner() const noexcept { return owner_; }

private:
  IUnknown& owner_;
};

// IProvideClassInfo2: the class's coclass type info and its default source interface.
class ClassInfoProvider final : public Companion<IProvideClassInfo2> {
public:
  ClassInfoProvider(IUnknown& owner, const ClassIdentity& cls) noexcept : Companion(owner), class_(cls) {}

  STDMETHODIMP GetClassInfo(ITypeInfo** out) override;
  STDMETHODIMP GetGUID(DWORD kind, GUID* out) override;

private:
  const ClassIdentity& class_;
};

// ISupportErrorInfo: the class's dual interface leaves error information on failure.
class ErrorInfoSupport final : public Companion<ISupportErrorInfo> {
public:
  ErrorInfoSupport(IUnknown& owner, const ClassIdentity& cls) noexcept : Companion(owner), class_(cls) {}

  STDMETHODIMP InterfaceSupportsErrorInfo(REFIID riid) override;

private:
  const ClassIdentity& class_;
};

}  // namespace br::com
