// A port of another make for the control tests: its name and points are whatever the test
// sets; sun times 05:30, 06:00, 18:00 and 18:30 of its day. Lives on the test's stack.
#pragma once

#include "BR_Info.h"
#include "tests/wine/common/not_a_port.h"

#include <algorithm>
#include <string>
#include <vector>

namespace br::test {

class FakeTidesPort final : public ITidesPort {
public:
  explicit FakeTidesPort(const wchar_t* portName = L"Fake") : name(portName) {}

  std::wstring name;
  std::vector<double> points;
  double predictionDate = 45000.0;  // 2023-03-15

  ULONG References() const { return refs_; }

  STDMETHODIMP QueryInterface(REFIID riid, void** out) override {
    if (!out) return E_POINTER;
    *out = nullptr;
    if (!IsEqualIID(riid, IID_IUnknown) && !IsEqualIID(riid, IID_IDispatch) && !IsEqualIID(riid, IID_ITidesPort))
      return E_NOINTERFACE;
    *out = static_cast<ITidesPort*>(this);
    AddRef();
    return S_OK;
  }
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override { return --refs_; }
  // IDispatch: early binding only.
  STDMETHODIMP GetTypeInfoCount(UINT* count) override { return Give(count, 0); }
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo** out) override { return Give(out, nullptr), E_NOTIMPL; }
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) override {
    return E_NOTIMPL;
  }
  // ITidesPort
  STDMETHODIMP get_PortName(BSTR* out) override { return Give(out, SysAllocString(name.c_str())); }
  STDMETHODIMP GetPortPos(double* lat, double* lon) override { return lat && lon ? Give(lon, -4.5), Give(lat, 48.0) : E_POINTER; }
  STDMETHODIMP Calculate(double, double) override { return S_OK; }
  STDMETHODIMP get_PredictionDate(double* value) override { return Give(value, predictionDate); }
  STDMETHODIMP get_NumPoints(LONG* count) override { return Give(count, points.size()); }
  STDMETHODIMP get_WavePoint(LONG index, double* value) override {
    if (index < 0 || static_cast<std::size_t>(index) >= points.size()) return E_INVALIDARG;
    return Give(value, points[static_cast<std::size_t>(index)]);
  }
  STDMETHODIMP get_MaxValueIndex(LONG* index) override { return Extreme(index, Highest() - points.begin()); }
  STDMETHODIMP get_MinValueIndex(LONG* index) override { return Extreme(index, Lowest() - points.begin()); }
  STDMETHODIMP get_MaxValue(double* value) override { return Extreme(value, points.empty() ? 0 : *Highest()); }
  STDMETHODIMP get_MinValue(double* value) override { return Extreme(value, points.empty() ? 0 : *Lowest()); }
  STDMETHODIMP get_Step(double* value) override {
    return Give(value, points.size() > 1 ? 24.0 / static_cast<double>(points.size() - 1) : 0.0);
  }
  STDMETHODIMP get_SunRise(double* value) override { return Give(value, predictionDate + 6.0 / 24.0); }
  STDMETHODIMP get_SunSet(double* value) override { return Give(value, predictionDate + 18.0 / 24.0); }
  STDMETHODIMP get_BeginTwilight(double* value) override { return Give(value, predictionDate + 5.5 / 24.0); }
  STDMETHODIMP get_EndTwilight(double* value) override { return Give(value, predictionDate + 18.5 / 24.0); }
  STDMETHODIMP get_TimeZone(LONG* zone) override { return Give(zone, 0); }

private:
  template <class T, class U>
  static HRESULT Give(T* out, U value) {
    if (!out) return E_POINTER;
    *out = static_cast<T>(value);
    return S_OK;
  }
  template <class T, class U>
  HRESULT Extreme(T* out, U value) const {
    return points.empty() ? E_ACCESSDENIED : Give(out, value);
  }
  std::vector<double>::const_iterator Highest() const { return std::max_element(points.begin(), points.end()); }
  std::vector<double>::const_iterator Lowest() const { return std::min_element(points.begin(), points.end()); }
  ULONG refs_ = 0;
};

}  // namespace br::test
