// A TidesPort of another make: an ITidesPort written here, with every answer settable
// (NaN and infinite heights and times, absurd point counts, failing getters) and a hook
// that runs inside each getter, for hosts of ports to be tried against. It lives on the
// heap and deletes itself at its last Release, as a real object does.
#pragma once

#include "BR_Info.h"

#include <functional>
#include <vector>

namespace br::test {

class ForeignPort final : public ITidesPort {
public:
  static ForeignPort* Create() { return new ForeignPort(); }  // one reference, the caller's

  // What the getters answer; a failing result leaves the out-parameter alone.
  long points = 25;            // NumPoints
  double height = 1.0;         // every WavePoint
  std::vector<double> heights;  // when not empty: WavePoint(k), else height
  double maxValue = 2.0, minValue = 0.0;
  double predictionDate = 45000.0;
  double sunRise = 45000.25, sunSet = 45000.75, twilightBegin = 45000.2, twilightEnd = 45000.8;
  HRESULT result = S_OK;        // of every getter
  std::function<void()> onGet;  // runs at the end of every getter, after the answer
  long getterCalls = 0;

  ULONG References() const { return refs_; }
  static long Alive() { return alive_; }

  // IUnknown
  STDMETHODIMP QueryInterface(REFIID riid, void** out) override;
  STDMETHODIMP_(ULONG) AddRef() override { return ++refs_; }
  STDMETHODIMP_(ULONG) Release() override;
  // IDispatch: not offered to late binding
  STDMETHODIMP GetTypeInfoCount(UINT* count) override;
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo** out) override;
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) override {
    return E_NOTIMPL;
  }
  // ITidesPort
  STDMETHODIMP get_PortName(BSTR* name) override;
  STDMETHODIMP GetPortPos(double* latitude, double* longitude) override;
  STDMETHODIMP Calculate(double, double) override;
  STDMETHODIMP get_PredictionDate(double* v) override { return Get(predictionDate, v); }
  STDMETHODIMP get_NumPoints(long* v) override { return Get(points, v); }
  STDMETHODIMP get_WavePoint(long index, double* v) override;
  STDMETHODIMP get_MaxValueIndex(long* v) override { return Get(0L, v); }
  STDMETHODIMP get_MinValueIndex(long* v) override { return Get(0L, v); }
  STDMETHODIMP get_MaxValue(double* v) override { return Get(maxValue, v); }
  STDMETHODIMP get_MinValue(double* v) override { return Get(minValue, v); }
  STDMETHODIMP get_Step(double* v) override { return Get(24.0 / (points > 1 ? points - 1 : 1), v); }
  STDMETHODIMP get_SunRise(double* v) override { return Get(sunRise, v); }
  STDMETHODIMP get_SunSet(double* v) override { return Get(sunSet, v); }
  STDMETHODIMP get_BeginTwilight(double* v) override { return Get(twilightBegin, v); }
  STDMETHODIMP get_EndTwilight(double* v) override { return Get(twilightEnd, v); }
  STDMETHODIMP get_TimeZone(long* v) override { return Get(0L, v); }

private:
  ForeignPort() { ++alive_; }
  ~ForeignPort() { --alive_; }
  template <class T>
  HRESULT Get(T value, T* out) {
    HRESULT hr = E_POINTER;
    if (out) {
      hr = result;
      if (SUCCEEDED(hr)) *out = value;
    }
    return Leave(hr);
  }
  // Runs the hook last, on a copy, touching nothing of the object afterwards: the hook
  // may end the object.
  HRESULT Leave(HRESULT hr) {
    ++getterCalls;
    if (onGet) {
      const std::function<void()> hook = onGet;
      hook();
    }
    return hr;
  }

  ULONG refs_ = 1;
  static inline long alive_ = 0;
};

}  // namespace br::test
