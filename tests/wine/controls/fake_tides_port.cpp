#include "tests/wine/controls/fake_tides_port.h"

#include <algorithm>

namespace br::test {

namespace {

template <class T, class U>
HRESULT Give(T* out, U value) {
  if (!out) return E_POINTER;
  *out = static_cast<T>(value);
  return S_OK;
}

}  // namespace

STDMETHODIMP FakeTidesPort::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) || IsEqualIID(riid, IID_ITidesPort)) {
    *out = static_cast<ITidesPort*>(this);
    AddRef();
    return S_OK;
  }
  *out = nullptr;
  return E_NOINTERFACE;
}

STDMETHODIMP FakeTidesPort::GetTypeInfoCount(UINT* count) { return Give(count, 0); }

STDMETHODIMP FakeTidesPort::GetTypeInfo(UINT, LCID, ITypeInfo** out) {
  if (out) *out = nullptr;
  return E_NOTIMPL;
}

STDMETHODIMP FakeTidesPort::get_PortName(BSTR* out) { return Give(out, SysAllocString(name.c_str())); }

STDMETHODIMP FakeTidesPort::GetPortPos(double* lat, double* lon) {
  if (!lat || !lon) return E_POINTER;
  *lat = latitude;
  *lon = longitude;
  return S_OK;
}

STDMETHODIMP FakeTidesPort::Calculate(double step, double date) {
  ++calculateCalls;
  lastStep = step;
  lastDate = date;
  return S_OK;
}

STDMETHODIMP FakeTidesPort::get_PredictionDate(double* value) { return Give(value, predictionDate); }
STDMETHODIMP FakeTidesPort::get_NumPoints(LONG* count) { return Give(count, points.size()); }
STDMETHODIMP FakeTidesPort::get_TimeZone(LONG* zone) { return Give(zone, 0); }

STDMETHODIMP FakeTidesPort::get_WavePoint(LONG index, double* value) {
  if (value && (index < 0 || static_cast<std::size_t>(index) >= points.size())) return E_INVALIDARG;
  return Give(value, value ? points[static_cast<std::size_t>(index)] : 0.0);
}

STDMETHODIMP FakeTidesPort::get_MaxValueIndex(LONG* index) {
  if (index && points.empty()) return E_ACCESSDENIED;
  return Give(index, index ? std::max_element(points.begin(), points.end()) - points.begin() : 0);
}

STDMETHODIMP FakeTidesPort::get_MinValueIndex(LONG* index) {
  if (index && points.empty()) return E_ACCESSDENIED;
  return Give(index, index ? std::min_element(points.begin(), points.end()) - points.begin() : 0);
}

STDMETHODIMP FakeTidesPort::get_MaxValue(double* value) {
  if (value && points.empty()) return E_ACCESSDENIED;
  return Give(value, value ? *std::max_element(points.begin(), points.end()) : 0.0);
}

STDMETHODIMP FakeTidesPort::get_MinValue(double* value) {
  if (value && points.empty()) return E_ACCESSDENIED;
  return Give(value, value ? *std::min_element(points.begin(), points.end()) : 0.0);
}

STDMETHODIMP FakeTidesPort::get_Step(double* value) {
  return Give(value, points.size() > 1 ? 24.0 / static_cast<double>(points.size() - 1) : 0.0);
}

HRESULT FakeTidesPort::Event(const std::optional<double>& hours, double* value) const {
  if (value && !hours) return E_FAIL;
  return Give(value, value ? predictionDate + *hours / 24.0 : 0.0);
}

}  // namespace br::test
