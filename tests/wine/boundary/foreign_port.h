// A TidesPort of another make: every answer settable (NaN and infinite values, absurd
// counts, failing getters) and a hook that runs last inside each getter. It lives on the
// heap and deletes itself at its last Release, as a real object does.
#pragma once

#include "BR_Info.h"

#include <functional>
#include <vector>

namespace br::test {

class ForeignPort final : public ITidesPort {
public:
  static ForeignPort* Create() { return new ForeignPort(); }  // one reference, the caller's

  long points = 25;
  double height = 1.0;          // every WavePoint
  std::vector<double> heights;  // when not empty: WavePoint(k), else height
  double maxValue = 2.0, minValue = 0.0;
  double predictionDate = 45000.0;
  double sunRise = 45000.25, sunSet = 45000.75, twilightBegin = 45000.2, twilightEnd = 45000.8;
  HRESULT result = S_OK;        // of every getter
  std::function<void()> onGet;  // may end the object

  ULONG References() const { return refs_; }
  static long Alive() { return alive_; }

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
  STDMETHODIMP_(ULONG) Release() override {
    const ULONG left = --refs_;
    if (left == 0) delete this;
    return left;
  }
  // IDispatch: not offered to late binding
  STDMETHODIMP GetTypeInfoCount(UINT* count) override { return count ? (*count = 0, S_OK) : E_POINTER; }
  STDMETHODIMP GetTypeInfo(UINT, LCID, ITypeInfo** out) override { return out ? (*out = nullptr, E_NOTIMPL) : E_POINTER; }
  STDMETHODIMP GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) override { return E_NOTIMPL; }
  STDMETHODIMP Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) override {
    return E_NOTIMPL;
  }
  STDMETHODIMP get_PortName(BSTR* v) override { return Answer(v, [&] { *v = SysAllocString(L"Foreign"); }); }
  STDMETHODIMP GetPortPos(double* latitude, double* longitude) override {
    return Answer(latitude && longitude, [&] { *latitude = 50.0, *longitude = -4.0; });
  }
  STDMETHODIMP Calculate(double, double) override { return S_OK; }
  STDMETHODIMP get_PredictionDate(double* v) override { return Get(predictionDate, v); }
  STDMETHODIMP get_NumPoints(long* v) override { return Get(points, v); }
  STDMETHODIMP get_WavePoint(long k, double* v) override {
    if (v && SUCCEEDED(result) && (k < 0 || k >= points)) return Answer(true, [] {}, E_INVALIDARG);
    return Get(heights.empty() ? height : heights[static_cast<std::size_t>(k) % heights.size()], v);
  }
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
    return Answer(out != nullptr, [&] { *out = value; });
  }
  // E_POINTER for a missing pointer, else the set result (written only on success); then
  // the hook, on a copy, touching nothing of the object afterwards.
  template <class F>
  HRESULT Answer(bool pointers, F write, HRESULT refusal = S_OK) {
    const HRESULT hr = !pointers ? E_POINTER : FAILED(refusal) ? refusal : result;
    if (pointers && SUCCEEDED(hr)) write();
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
