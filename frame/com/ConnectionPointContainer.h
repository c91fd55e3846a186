// The container that hands out a class's connection point (IConnectionPointContainer).
#pragma once

#include "frame/com/Companion.h"
#include "frame/com/ConnectionPoint.h"

#include <memory>

namespace br::com {

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
