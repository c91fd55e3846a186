// A day in the station's zone time, offered to the TidesWindow control as a port of its
// own: the library's port starts its day at the computer's standard midnight, so its
// curve and its sun bands (station time) disagree by the difference of the two clocks.
// This port answers the control's reads from a day brtide read from the library's port
// every minute and put on the station's clock. Early binding only; reference counted.
#pragma once

#include "BR_Info.h"
#include "host/brtide/day_report.h"

namespace br::brtide {

class StationTimePort final : public ITidesPort {
public:
  // A new port with one reference, showing day (its heights, sun times and position).
  static StationTimePort* Create(const DayReport& day);

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override;
  STDMETHODIMP_(ULONG) Release() override;
  STDMETHODIMP GetTypeInfoCount(UINT* count) override;
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo** out) override;
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override;
  STDMETHODIMP Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) override;

  STDMETHODIMP get_PortName(BSTR* name) override;
  STDMETHODIMP GetPortPos(double* latitude, double* longitude) override;
  STDMETHODIMP Calculate(double step, double predictDate) override;  // refused: the day is fixed
  STDMETHODIMP get_PredictionDate(double* date) override;
  STDMETHODIMP get_NumPoints(LONG* count) override;
  STDMETHODIMP get_WavePoint(LONG index, double* value) override;
  STDMETHODIMP get_MaxValueIndex(LONG* index) override;
  STDMETHODIMP get_MinValueIndex(LONG* index) override;
  STDMETHODIMP get_MaxValue(double* value) override;
  STDMETHODIMP get_MinValue(double* value) override;
  STDMETHODIMP get_Step(double* step) override;
  STDMETHODIMP get_SunRise(double* date) override;
  STDMETHODIMP get_SunSet(double* date) override;
  STDMETHODIMP get_BeginTwilight(double* date) override;
  STDMETHODIMP get_EndTwilight(double* date) override;
  STDMETHODIMP get_TimeZone(LONG* zone) override;

private:
  explicit StationTimePort(const DayReport& day) : day_(day) {}
  ~StationTimePort() = default;

  DayReport day_;
  ULONG references_ = 1;
};

}  // namespace br::brtide
