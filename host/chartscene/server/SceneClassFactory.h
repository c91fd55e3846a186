#pragma once
// The class object of each creatable class of the stand-in host.

#include <windows.h>
#include <unknwn.h>

namespace br::chartscene {

// Makes a new object with one reference; a failure returns its HRESULT.
using SceneCreateFunction = HRESULT (*)(IUnknown** object);

class SceneClassFactory final : public IClassFactory {
public:
  // One reference for the caller; every reference holds a module lock.
  explicit SceneClassFactory(SceneCreateFunction create);

  STDMETHODIMP QueryInterface(REFIID iid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override;
  STDMETHODIMP_(ULONG) Release() override;
  STDMETHODIMP CreateInstance(IUnknown* outer, REFIID iid, void** out) override;
  STDMETHODIMP LockServer(BOOL lock) override;

private:
  ~SceneClassFactory() = default;

  volatile LONG refs_ = 1;
  SceneCreateFunction create_;
};

}  // namespace br::chartscene
