// Faces of an object that are separate C++ objects (the frame keeps to single
// inheritance): each derives from one interface and hands IUnknown to its owner, so the
// owner's reference count and interface table govern them.
#pragma once

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

}  // namespace br::com
