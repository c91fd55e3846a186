// IPersistStorage of a control: the same state as the stream form, kept in a stream
// named "Contents" of the container's storage.
#pragma once

#include "frame/com/Companion.h"

#include <objidl.h>

namespace br::control {

class ControlCore;

class PersistStorageFace final : public br::com::Companion<IPersistStorage> {
public:
  PersistStorageFace(IUnknown& owner, ControlCore& core) noexcept : Companion(owner), core_(core) {}

  STDMETHODIMP GetClassID(CLSID* clsid) override;
  STDMETHODIMP IsDirty() override;
  STDMETHODIMP InitNew(IStorage* storage) override;
  STDMETHODIMP Load(IStorage* storage) override;
  STDMETHODIMP Save(IStorage* storage, BOOL sameAsLoad) override;
  STDMETHODIMP SaveCompleted(IStorage* storage) override;
  STDMETHODIMP HandsOffStorage() override;

private:
  ControlCore& core_;
};

}  // namespace br::control
