// A port of another make for the control tests: its name, points, extremes, sun times
// and position are whatever the test sets, and a sun event can be left out (its getter
// fails). Records the Calculate calls it receives.
#pragma once

#include "BR_Info.h"
#include "tests/wine/common/not_a_port.h"

#include <optional>
#include <string>
#include <vector>

namespace br::test {

class FakeTidesPort final : public ITidesPort {
public:
  explicit FakeTidesPort(const wchar_t* portName = L"Fake") : name(portName) {}

  std::wstring name;
  std::vector<double> points;
  double predictionDate = 45000.0;  // 2023-03-15
  double latitude = 48.0;
  double longitude = -4.5;
  // Hours of the day; nullopt: the getter fails.
  std::optional<double> twilightBegin = 5.5;
  std::optional<double> sunrise = 6.0;
  std::optional<double> sunset = 18.0;
  std::optional<double> twilightEnd = 18.5;

  // What Calculate received.
  int calculateCalls = 0;
  double lastStep = 0.0;
  double lastDate = 0.0;

  ULONG References() const { return refs_; }

  // IUnknown: lives on the test's stack.
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override { return --refs_; }
  // IDispatch: early binding only.
  STDMETHODIMP GetTypeInfoCount(UINT* count) override;
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo** out) override;
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) override {
    return E_NOTIMPL;
  }
  // ITidesPort
  STDMETHODIMP get_PortName(BSTR* name) override;
  STDMETHODIMP GetPortPos(double* lat, double* lon) override;
  STDMETHODIMP Calculate(double step, double date) override;
  STDMETHODIMP get_PredictionDate(double* value) override;
  STDMETHODIMP get_NumPoints(LONG* count) override;
  STDMETHODIMP get_WavePoint(LONG index, double* value) override;
  STDMETHODIMP get_MaxValueIndex(LONG* index) override;
  STDMETHODIMP get_MinValueIndex(LONG* index) override;
  STDMETHODIMP get_MaxValue(double* value) override;
  STDMETHODIMP get_MinValue(double* value) override;
  STDMETHODIMP get_Step(double* value) override;
  STDMETHODIMP get_SunRise(double* value) override { return Event(sunrise, value); }
  STDMETHODIMP get_SunSet(double* value) override { return Event(sunset, value); }
  STDMETHODIMP get_BeginTwilight(double* value) override { return Event(twilightBegin, value); }
  STDMETHODIMP get_EndTwilight(double* value) override { return Event(twilightEnd, value); }
  STDMETHODIMP get_TimeZone(LONG* zone) override;

private:
  HRESULT Event(const std::optional<double>& hours, double* value) const;
  ULONG refs_ = 0;
};

}  // namespace br::test
