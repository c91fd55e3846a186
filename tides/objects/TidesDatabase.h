// TidesDatabase: opens a folder of tide station files (once per process), lists the
// stations and hands out TidesPort objects.
#pragma once

#include "frame/com/DispatchObject.h"

#include "BR_Info.h"

#include <cstdint>

namespace br::tides {

class TidesDatabase final : public br::com::DispatchObject<TidesDatabase, ITidesDatabase> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  TidesDatabase() = default;

  // Closes the station files if a TidesDatabase opened them (module unload).
  static void CloseStationFiles() noexcept;

  // ITidesDatabase
  STDMETHODIMP Initialize(BSTR folder) override;
  STDMETHODIMP get_NumPorts(long* count) override;
  STDMETHODIMP GetPortInfo(long index, double* latitude, double* longitude, BSTR* name) override;
  STDMETHODIMP GetPort(long index, IUnknown** port) override;
  STDMETHODIMP GetPorts(double latMin, double lonMin, double latMax, double lonMax, VARIANT* ports) override;

private:
  bool initialised_ = false;
};

}  // namespace br::tides
