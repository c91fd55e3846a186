#include "frame/com/ConnectionPointContainer.h"

#include "frame/com/Enumerator.h"

#include <new>
#include <vector>

namespace br::com {

ConnectionPointContainer::ConnectionPointContainer(IUnknown& owner, const IID* events) : Companion(owner) {
  if (events) point_ = std::make_unique<ConnectionPoint>(owner, *events);
}

STDMETHODIMP ConnectionPointContainer::EnumConnectionPoints(IEnumConnectionPoints** out) {
  if (!out) return E_POINTER;
  *out = nullptr;
  try {
    std::vector<IConnectionPoint*> items;
    if (point_) items.push_back(point_.get());
    return ConnectionPointEnumerator::Create(items, 0, out);
  } catch (const std::bad_alloc&) {
    return E_OUTOFMEMORY;
  }
}

STDMETHODIMP ConnectionPointContainer::FindConnectionPoint(REFIID riid, IConnectionPoint** out) {
  if (!out) return E_POINTER;
  *out = nullptr;
  IID events;
  if (!point_ || FAILED(point_->GetConnectionInterface(&events)) || !IsEqualIID(events, riid)) {
    return CONNECT_E_NOCONNECTION;
  }
  *out = point_.get();
  (*out)->AddRef();
  return S_OK;
}

}  // namespace br::com
