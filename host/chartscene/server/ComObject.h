#pragma once
// Reference counting and QueryInterface for the stand-in host's objects. Each live object
// holds a module lock and counts in "live.<kind>" (scene_counters.h), so a test can see
// whether a client gave back every object it received.

#include <windows.h>
#include <unknwn.h>

#include <string>
#include <tuple>

#include "host/chartscene/model/scene_counters.h"
#include "host/chartscene/server/SceneModule.h"

namespace br::chartscene {

template <class... Interfaces>
class ComObject : public Interfaces... {
public:
  explicit ComObject(const char* kind) : kind_(kind) {
    SceneModule::Lock();
    AddToLiveCounter(kind_, 1);
  }
  ComObject(const ComObject&) = delete;
  ComObject& operator=(const ComObject&) = delete;

  STDMETHODIMP QueryInterface(REFIID iid, void** out) override {
    if (out == nullptr) return E_POINTER;
    *out = nullptr;
    if (IsEqualIID(iid, IID_IUnknown)) {
      *out = static_cast<IUnknown*>(static_cast<First*>(this));
    } else if (!Offers(iid)) {
      return E_NOINTERFACE;
    } else if (!((IsEqualIID(iid, __uuidof(Interfaces)) &&
                  (*out = static_cast<Interfaces*>(this), true)) || ...)) {
      *out = QueryExtra(iid);
    }
    if (*out == nullptr) return E_NOINTERFACE;
    AddRef();
    return S_OK;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return static_cast<ULONG>(InterlockedIncrement(&refs_)); }
  STDMETHODIMP_(ULONG) Release() override {
    const LONG left = InterlockedDecrement(&refs_);
    if (left == 0) delete this;
    return static_cast<ULONG>(left);
  }

protected:
  virtual ~ComObject() {
    AddToLiveCounter(kind_, -1);
    SceneModule::Unlock();
  }
  // Interfaces answered by a member rather than a base; null when there is none.
  virtual void* QueryExtra(REFIID) { return nullptr; }
  // False for a base interface this object does not answer after all (a vector dataset
  // that is no library).
  virtual bool Offers(REFIID) const { return true; }

private:
  using First = std::tuple_element_t<0, std::tuple<Interfaces...>>;

  volatile LONG refs_ = 1;
  std::string kind_;
};

}  // namespace br::chartscene
