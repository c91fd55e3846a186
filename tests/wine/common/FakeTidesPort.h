// A port of another make for the control tests: its name and points are whatever the test
// sets; at 48 N, sun times 05:30, 06:00, 18:00 and 18:30 of its day; no index, step or
// zone. Lives on the test's stack.
#pragma once

#include "BR_Info.h"
#include "tests/wine/common/NotAPort.h"

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
    const bool port =
        IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) || IsEqualIID(riid, IID_ITidesPort);
    *out = port ? static_cast<ITidesPort*>(this) : nullptr;
    return port ? (AddRef(), S_OK) : E_NOINTERFACE;
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
  STDMETHODIMP GetPortPos(double* lat, double* lon) override { return Give(lon, -4.5), Give(lat, 48.0); }
  STDMETHODIMP Calculate(double, double) override { return S_OK; }
  STDMETHODIMP get_PredictionDate(double* value) override { return Give(value, predictionDate); }
  STDMETHODIMP get_NumPoints(LONG* count) override { return Give(count, points.size()); }
  STDMETHODIMP get_WavePoint(LONG index, double* value) override {
    if (index < 0 || static_cast<std::size_t>(index) >= points.size()) return E_INVALIDARG;
    return Give(value, points[static_cast<std::size_t>(index)]);
  }
  STDMETHODIMP get_MaxValue(double* value) override {
    return points.empty() ? E_ACCESSDENIED : Give(value, *std::max_element(points.begin(), points.end()));
  }
  STDMETHODIMP get_MinValue(double* value) override {
    return points.empty() ? E_ACCESSDENIED : Give(value, *std::min_element(points.begin(), points.end()));
  }
  STDMETHODIMP get_MaxValueIndex(LONG*) override { return E_NOTIMPL; }
  STDMETHODIMP get_MinValueIndex(LONG*) override { return E_NOTIMPL; }
  STDMETHODIMP get_Step(double*) override { return E_NOTIMPL; }
  STDMETHODIMP get_TimeZone(LONG*) override { return E_NOTIMPL; }
  STDMETHODIMP get_SunRise(double* value) override { return Give(value, predictionDate + 6.0 / 24.0); }
  STDMETHODIMP get_SunSet(double* value) override { return Give(value, predictionDate + 18.0 / 24.0); }
  STDMETHODIMP get_BeginTwilight(double* value) override { return Give(value, predictionDate + 5.5 / 24.0); }
  STDMETHODIMP get_EndTwilight(double* value) override { return Give(value, predictionDate + 18.5 / 24.0); }

private:
  template <class T, class U>
  static HRESULT Give(T* out, U value) {
    if (!out) return E_POINTER;
    *out = static_cast<T>(value);
    return S_OK;
  }
  ULONG refs_ = 0;
};

}  // namespace br::test
