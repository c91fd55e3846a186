#include "tests/wine/controls/fake_tides_port.h"

#include <algorithm>

namespace br::test {

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

STDMETHODIMP FakeTidesPort::GetTypeInfoCount(UINT* count) {
  if (count) *count = 0;
  return S_OK;
}

STDMETHODIMP FakeTidesPort::GetTypeInfo(UINT, LCID, ITypeInfo** out) {
  if (out) *out = nullptr;
  return E_NOTIMPL;
}

STDMETHODIMP FakeTidesPort::get_PortName(BSTR* out) {
  if (!out) return E_POINTER;
  *out = SysAllocString(name.c_str());
  return S_OK;
}

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

STDMETHODIMP FakeTidesPort::get_PredictionDate(double* value) {
  if (!value) return E_POINTER;
  *value = predictionDate;
  return S_OK;
}

STDMETHODIMP FakeTidesPort::get_NumPoints(LONG* count) {
  if (!count) return E_POINTER;
  *count = static_cast<LONG>(points.size());
  return S_OK;
}

STDMETHODIMP FakeTidesPort::get_WavePoint(LONG index, double* value) {
  if (!value) return E_POINTER;
  if (index < 0 || static_cast<std::size_t>(index) >= points.size()) return E_INVALIDARG;
  *value = points[static_cast<std::size_t>(index)];
  return S_OK;
}

STDMETHODIMP FakeTidesPort::get_MaxValueIndex(LONG* index) {
  if (!index) return E_POINTER;
  if (points.empty()) return E_ACCESSDENIED;
  *index = static_cast<LONG>(std::max_element(points.begin(), points.end()) - points.begin());
  return S_OK;
}

STDMETHODIMP FakeTidesPort::get_MinValueIndex(LONG* index) {
  if (!index) return E_POINTER;
  if (points.empty()) return E_ACCESSDENIED;
  *index = static_cast<LONG>(std::min_element(points.begin(), points.end()) - points.begin());
  return S_OK;
}

STDMETHODIMP FakeTidesPort::get_MaxValue(double* value) {
  if (!value) return E_POINTER;
  if (points.empty()) return E_ACCESSDENIED;
  *value = *std::max_element(points.begin(), points.end());
  return S_OK;
}

STDMETHODIMP FakeTidesPort::get_MinValue(double* value) {
  if (!value) return E_POINTER;
  if (points.empty()) return E_ACCESSDENIED;
  *value = *std::min_element(points.begin(), points.end());
  return S_OK;
}

STDMETHODIMP FakeTidesPort::get_Step(double* value) {
  if (!value) return E_POINTER;
  *value = points.size() > 1 ? 24.0 / static_cast<double>(points.size() - 1) : 0.0;
  return S_OK;
}

STDMETHODIMP FakeTidesPort::get_TimeZone(LONG* zone) {
  if (!zone) return E_POINTER;
  *zone = 0;
  return S_OK;
}

HRESULT FakeTidesPort::Event(const std::optional<double>& hours, double* value) const {
  if (!value) return E_POINTER;
  if (!hours) return E_FAIL;
  *value = predictionDate + *hours / 24.0;
  return S_OK;
}

}  // namespace br::test
