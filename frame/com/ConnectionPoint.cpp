#include "frame/com/ConnectionPoint.h"

#include "frame/com/Enumerator.h"

#include <oleauto.h>

#include <new>

namespace br::com {

ConnectionPoint::~ConnectionPoint() {
  for (const Connection& c : connections_) c.sink->Release();
}

STDMETHODIMP ConnectionPoint::GetConnectionInterface(IID* out) {
  if (!out) return E_POINTER;
  *out = events_;
  return S_OK;
}

STDMETHODIMP ConnectionPoint::GetConnectionPointContainer(IConnectionPointContainer** out) {
  if (!out) return E_POINTER;
  return Owner().QueryInterface(IID_IConnectionPointContainer, reinterpret_cast<void**>(out));
}

STDMETHODIMP ConnectionPoint::Advise(IUnknown* sink, DWORD* cookie) {
  if (!cookie) return E_POINTER;
  *cookie = 0;
  if (!sink) return E_POINTER;
  IDispatch* dispatch = nullptr;
  // A sink answers the events dispinterface; a plain IDispatch sink is taken as well.
  if (FAILED(sink->QueryInterface(events_, reinterpret_cast<void**>(&dispatch))) &&
      FAILED(sink->QueryInterface(IID_IDispatch, reinterpret_cast<void**>(&dispatch)))) {
    return CONNECT_E_CANNOTCONNECT;
  }
  if (!dispatch) return CONNECT_E_CANNOTCONNECT;
  try {
    connections_.push_back(Connection{nextCookie_, dispatch});
  } catch (const std::bad_alloc&) {
    dispatch->Release();
    return E_OUTOFMEMORY;
  }
  *cookie = nextCookie_++;
  if (nextCookie_ == 0) nextCookie_ = 1;  // 0 is never a valid cookie
  return S_OK;
}

STDMETHODIMP ConnectionPoint::Unadvise(DWORD cookie) {
  for (auto it = connections_.begin(); it != connections_.end(); ++it) {
    if (it->cookie == cookie) {
      IDispatch* sink = it->sink;
      connections_.erase(it);
      sink->Release();  // after the erase: the release may call back into this object
      return S_OK;
    }
  }
  return CONNECT_E_NOCONNECTION;
}

STDMETHODIMP ConnectionPoint::EnumConnections(IEnumConnections** out) {
  if (!out) return E_POINTER;
  *out = nullptr;
  try {
    std::vector<CONNECTDATA> items;
    items.reserve(connections_.size());
    for (const Connection& c : connections_) items.push_back(CONNECTDATA{c.sink, c.cookie});
    return ConnectionEnumerator::Create(items, 0, out);
  } catch (const std::bad_alloc&) {
    return E_OUTOFMEMORY;
  }
}

IDispatch* ConnectionPoint::SinkOf(DWORD cookie) const noexcept {
  for (const Connection& c : connections_) {
    if (c.cookie == cookie) return c.sink;
  }
  return nullptr;
}

void ConnectionPoint::Fire(DISPID id, DISPPARAMS* params) noexcept {
  if (connections_.empty()) return;
  std::vector<DWORD> round;
  try {
    round.reserve(connections_.size());
    for (const Connection& c : connections_) round.push_back(c.cookie);
  } catch (const std::bad_alloc&) {
    return;  // no memory to keep the round: nobody is called rather than some twice
  }
  DISPPARAMS none = {nullptr, nullptr, 0, 0};
  Owner().AddRef();
  for (DWORD cookie : round) {
    IDispatch* sink = SinkOf(cookie);
    if (!sink) continue;  // disconnected by an earlier sink of this round
    sink->AddRef();
    VARIANT result;
    VariantInit(&result);
    sink->Invoke(id, IID_NULL, LOCALE_USER_DEFAULT, DISPATCH_METHOD, params ? params : &none, &result,
                 nullptr, nullptr);
    VariantClear(&result);
    sink->Release();
  }
  Owner().Release();
}

}  // namespace br::com
