// TidesPort: one tide station. TidesDatabase::GetPort makes it with the station's name
// and position; Calculate predicts one day through the process-wide engine, keeps the
// heights and sun times, and fires Calculated. A port created directly stays
// uninitialised and answers E_ACCESSDENIED.
#pragma once

#include "frame/com/DispatchObject.h"

#include "BR_Info.h"

#include <cstdint>
#include <string>
#include <vector>

namespace br::tides {

class TidesPort final : public br::com::DispatchObject<TidesPort, ITidesPort> {
public:
  static const br::com::ClassIdentity kClass;
  static const Entry kInterfaces[];

  TidesPort() = default;

  // Makes the port a station's: initialised, without points.
  void Attach(const std::wstring& name, std::int16_t latitude, std::int16_t longitude);

  // ITidesPort
  STDMETHODIMP get_PortName(BSTR* name) override;
  STDMETHODIMP GetPortPos(double* latitude, double* longitude) override;
  STDMETHODIMP Calculate(double step, double predictDate) override;
  STDMETHODIMP get_PredictionDate(double* date) override;
  STDMETHODIMP get_NumPoints(long* count) override;
  STDMETHODIMP get_WavePoint(long index, double* value) override;
  STDMETHODIMP get_MaxValueIndex(long* index) override;
  STDMETHODIMP get_MinValueIndex(long* index) override;
  STDMETHODIMP get_MaxValue(double* value) override;
  STDMETHODIMP get_MinValue(double* value) override;
  STDMETHODIMP get_Step(double* step) override;
  STDMETHODIMP get_SunRise(double* date) override;
  STDMETHODIMP get_SunSet(double* date) override;
  STDMETHODIMP get_BeginTwilight(double* date) override;
  STDMETHODIMP get_EndTwilight(double* date) override;
  STDMETHODIMP get_TimeZone(long* zone) override;

private:
  // Runs the prediction; false when the day cannot be had (points are then emptied).
  bool Predict(double step);
  bool HasPoints() const noexcept { return initialised_ && !points_.empty(); }
  // E_ACCESSDENIED without points, E_POINTER for a null out, else S_OK.
  template <class T>
  HRESULT CheckPointsAndOut(T* out) const noexcept {
    if (!HasPoints()) return E_ACCESSDENIED;
    return out ? S_OK : E_POINTER;
  }
  HRESULT ReadDouble(double field, double* out) const noexcept;
  long MaxIndex() const noexcept;
  long MinIndex() const noexcept;

  bool initialised_ = false;
  std::wstring name_;
  std::int16_t latitude_ = 0;   // minutes of arc, north positive
  std::int16_t longitude_ = 0;  // minutes of arc, east positive
  std::int32_t timeZone_ = 0;   // hours: universal time = zone time + value
  double beginTwilight_ = 0.0;
  double endTwilight_ = 0.0;
  double sunRise_ = 0.0;
  double sunSet_ = 0.0;
  double predictionDate_ = 0.0;
  double step_ = 0.0;
  std::vector<float> points_;  // the engine's internal unit (published value x 100)
};

}  // namespace br::tides
