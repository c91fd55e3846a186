// Outgoing events: the one connection point of a class (its default source
// dispinterface). Events go synchronously to every sink through IDispatch::Invoke.
#pragma once

#include "frame/com/Companion.h"

#include <olectl.h>

#include <vector>

namespace br::com {

class ConnectionPoint final : public Companion<IConnectionPoint> {
public:
  // owner answers IConnectionPointContainer; events is the source dispinterface.
  ConnectionPoint(IUnknown& owner, const IID& events) noexcept : Companion(owner), events_(events) {}
  ~ConnectionPoint() override;

  STDMETHODIMP GetConnectionInterface(IID* out) override;
  STDMETHODIMP GetConnectionPointContainer(IConnectionPointContainer** out) override;
  STDMETHODIMP Advise(IUnknown* sink, DWORD* cookie) override;
  STDMETHODIMP Unadvise(DWORD cookie) override;
  STDMETHODIMP EnumConnections(IEnumConnections** out) override;

  // Calls Invoke(id, IID_NULL, user-default locale, DISPATCH_METHOD, params) of every sink
  // in connection order; results are ignored. The owner stays alive for the whole round,
  // and a sink may advise, unadvise or release the owner from inside its call: a sink
  // disconnected during the round is not called afterwards, one connected during it waits
  // for the next round.
  void Fire(DISPID id, DISPPARAMS* params) noexcept;

  std::size_t ConnectionCount() const noexcept { return connections_.size(); }

private:
  struct Connection {
    DWORD cookie;
    IDispatch* sink;  // one reference held
  };
  IDispatch* SinkOf(DWORD cookie) const noexcept;

  const IID& events_;
  std::vector<Connection> connections_;
  DWORD nextCookie_ = 1;
};

}  // namespace br::com
