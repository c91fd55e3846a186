// A standard COM enumerator over a snapshot of items. Every item holds its own reference
// (an enumerator of connection points thereby keeps their owner alive), and the
// enumerator holds a module lock for its lifetime.
#pragma once

#include "frame/com/Module.h"

#include <ocidl.h>

#include <new>
#include <vector>

namespace br::com {

inline void AddRefItem(IConnectionPoint* item) noexcept { item->AddRef(); }
inline void ReleaseItem(IConnectionPoint* item) noexcept { item->Release(); }
inline void AddRefItem(const CONNECTDATA& item) noexcept { item.pUnk->AddRef(); }
inline void ReleaseItem(const CONNECTDATA& item) noexcept { item.pUnk->Release(); }

template <class IEnum, class Item>
class Enumerator final : public IEnum {
public:
  // A new enumerator with one reference over copies of items (each AddRef'd).
  static HRESULT Create(const std::vector<Item>& items, std::size_t position, IEnum** out) noexcept {
    if (!out) return E_POINTER;
    *out = nullptr;
    try {
      *out = new Enumerator(items, position);
      return S_OK;
    } catch (const std::bad_alloc&) {
      return E_OUTOFMEMORY;
    }
  }

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    if (!out) return E_POINTER;
    if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, __uuidof(IEnum))) {
      *out = static_cast<IEnum*>(this);
      AddRef();
      return S_OK;
    }
    *out = nullptr;
    return E_NOINTERFACE;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return static_cast<ULONG>(InterlockedIncrement(&refs_)); }
  STDMETHODIMP_(ULONG) Release() override {
    const LONG n = InterlockedDecrement(&refs_);
    if (n == 0) delete this;
    return static_cast<ULONG>(n);
  }

  STDMETHODIMP Next(ULONG count, Item* out, ULONG* fetched) override {
    if (!out) return E_POINTER;
    if (count != 1 && !fetched) return E_INVALIDARG;
    ULONG n = 0;
    while (n < count && position_ < items_.size()) {
      out[n] = items_[position_++];
      AddRefItem(out[n]);
      ++n;
    }
    if (fetched) *fetched = n;
    return n == count ? S_OK : S_FALSE;
  }
  STDMETHODIMP Skip(ULONG count) override {
    const std::size_t left = items_.size() - position_;
    if (count > left) {
      position_ = items_.size();
      return S_FALSE;
    }
    position_ += count;
    return S_OK;
  }
  STDMETHODIMP Reset() override {
    position_ = 0;
    return S_OK;
  }
  STDMETHODIMP Clone(IEnum** out) override { return Create(items_, position_, out); }

private:
  Enumerator(const std::vector<Item>& items, std::size_t position) : items_(items), position_(position) {
    for (const Item& item : items_) AddRefItem(item);
  }
  ~Enumerator() {
    for (const Item& item : items_) ReleaseItem(item);
  }

  volatile LONG refs_ = 1;
  ModuleLockHolder lock_;
  std::vector<Item> items_;
  std::size_t position_;
};

using ConnectionPointEnumerator = Enumerator<IEnumConnectionPoints, IConnectionPoint*>;
using ConnectionEnumerator = Enumerator<IEnumConnections, CONNECTDATA>;

}  // namespace br::com
