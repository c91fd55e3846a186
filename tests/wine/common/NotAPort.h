// A plain COM object that is no port: what a host may hand over by mistake where a port
// is expected. Lives on the test's stack and counts its references.
#pragma once

#include <windows.h>
#include <objbase.h>

namespace br::test {

class NotAPort final : public IUnknown {
public:
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    if (!out) return E_POINTER;
    *out = IsEqualIID(riid, IID_IUnknown) ? static_cast<IUnknown*>(this) : nullptr;
    return *out ? (AddRef(), S_OK) : E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override { return --refs_; }
  ULONG References() const { return refs_; }

private:
  ULONG refs_ = 0;
};

}  // namespace br::test
