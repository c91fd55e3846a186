#include "host/brtide/StationTimePort.h"

#include <oleauto.h>

#include <new>

#include "host/brtide/wide_text.h"

namespace br::brtide {

namespace {

template <class T, class U>
HRESULT Give(T* out, U value) {
  if (!out) return E_POINTER;
  *out = static_cast<T>(value);
  return S_OK;
}

}  // namespace

StationTimePort* StationTimePort::Create(const DayReport& day) { return new (std::nothrow) StationTimePort(day); }

STDMETHODIMP StationTimePort::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  const bool port = IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) || IsEqualIID(riid, IID_ITidesPort);
  *out = port ? static_cast<ITidesPort*>(this) : nullptr;
  if (!port) return E_NOINTERFACE;
  AddRef();
  return S_OK;
}

STDMETHODIMP_(ULONG) StationTimePort::AddRef() { return ++references_; }

STDMETHODIMP_(ULONG) StationTimePort::Release() {
  const ULONG left = --references_;
  if (left == 0) delete this;
  return left;
}

STDMETHODIMP StationTimePort::GetTypeInfoCount(UINT* count) { return Give(count, 0); }
STDMETHODIMP StationTimePort::GetTypeInfo(UINT, LCID, ITypeInfo** out) { return Give(out, nullptr), E_NOTIMPL; }
STDMETHODIMP StationTimePort::GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) { return E_NOTIMPL; }
STDMETHODIMP StationTimePort::Invoke(DISPID, REFIID, LCID, WORD, DISPPARAMS*, VARIANT*, EXCEPINFO*, UINT*) {
  return E_NOTIMPL;
}

STDMETHODIMP StationTimePort::get_PortName(BSTR* name) {
  if (!name) return E_POINTER;
  const std::wstring wide = WideFromUtf8(day_.name);
  *name = SysAllocStringLen(wide.data(), static_cast<UINT>(wide.size()));
  return *name ? S_OK : E_OUTOFMEMORY;
}

STDMETHODIMP StationTimePort::GetPortPos(double* latitude, double* longitude) {
  if (!latitude || !longitude) return E_POINTER;
  *latitude = day_.position.latitude;
  *longitude = day_.position.longitude;
  return S_OK;
}

STDMETHODIMP StationTimePort::Calculate(double, double) { return E_NOTIMPL; }
STDMETHODIMP StationTimePort::get_PredictionDate(double* date) { return Give(date, day_.predictionDate); }
STDMETHODIMP StationTimePort::get_NumPoints(LONG* count) { return Give(count, day_.heights.size()); }

STDMETHODIMP StationTimePort::get_WavePoint(LONG index, double* value) {
  if (index < 0 || static_cast<std::size_t>(index) >= day_.heights.size()) return E_INVALIDARG;
  return Give(value, day_.heights[static_cast<std::size_t>(index)]);
}

STDMETHODIMP StationTimePort::get_MaxValueIndex(LONG* index) { return Give(index, HighestPoint(day_)); }
STDMETHODIMP StationTimePort::get_MinValueIndex(LONG* index) { return Give(index, LowestPoint(day_)); }
STDMETHODIMP StationTimePort::get_MaxValue(double* value) {
  return day_.heights.empty() ? E_ACCESSDENIED : Give(value, day_.heights[HighestPoint(day_)]);
}
STDMETHODIMP StationTimePort::get_MinValue(double* value) {
  return day_.heights.empty() ? E_ACCESSDENIED : Give(value, day_.heights[LowestPoint(day_)]);
}
STDMETHODIMP StationTimePort::get_Step(double* step) { return Give(step, day_.step); }
STDMETHODIMP StationTimePort::get_SunRise(double* date) { return Give(date, day_.sun.sunrise); }
STDMETHODIMP StationTimePort::get_SunSet(double* date) { return Give(date, day_.sun.sunset); }
STDMETHODIMP StationTimePort::get_BeginTwilight(double* date) { return Give(date, day_.sun.beginTwilight); }
STDMETHODIMP StationTimePort::get_EndTwilight(double* date) { return Give(date, day_.sun.endTwilight); }
STDMETHODIMP StationTimePort::get_TimeZone(LONG* zone) { return Give(zone, day_.zone); }

}  // namespace br::brtide
