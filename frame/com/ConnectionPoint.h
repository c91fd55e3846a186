// Outgoing events: one connection point per class (its default source dispinterface)
// and the container that hands it out. Events go synchronously to every sink through
// IDispatch::Invoke.
#pragma once

#include "frame/com/companions.h"

#include <olectl.h>

#include <memory>
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

class ConnectionPointContainer final : public Companion<IConnectionPointContainer> {
public:
  // events null: a container without connection points.
  ConnectionPointContainer(IUnknown& owner, const IID* events);

  STDMETHODIMP EnumConnectionPoints(IEnumConnectionPoints** out) override;
  STDMETHODIMP FindConnectionPoint(REFIID riid, IConnectionPoint** out) override;

  // The class's one connection point, or null when it has no events.
  ConnectionPoint* Point() noexcept { return point_.get(); }

private:
  std::unique_ptr<ConnectionPoint> point_;
};

}  // namespace br::com
