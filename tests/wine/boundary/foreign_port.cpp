#include "tests/wine/boundary/foreign_port.h"

namespace br::test {

STDMETHODIMP ForeignPort::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) || IsEqualIID(riid, IID_ITidesPort)) {
    *out = static_cast<ITidesPort*>(this);
    AddRef();
    return S_OK;
  }
  *out = nullptr;
  return E_NOINTERFACE;
}

STDMETHODIMP_(ULONG) ForeignPort::Release() {
  const ULONG left = --refs_;
  if (left == 0) delete this;
  return left;
}

STDMETHODIMP ForeignPort::GetTypeInfoCount(UINT* count) {
  if (count) *count = 0;
  return S_OK;
}

STDMETHODIMP ForeignPort::GetTypeInfo(UINT, LCID, ITypeInfo** out) {
  if (out) *out = nullptr;
  return E_NOTIMPL;
}

STDMETHODIMP ForeignPort::get_PortName(BSTR* name) {
  HRESULT hr = E_POINTER;
  if (name) {
    hr = result;
    if (SUCCEEDED(hr)) *name = SysAllocString(L"Foreign");
  }
  return Leave(hr);
}

STDMETHODIMP ForeignPort::GetPortPos(double* latitude, double* longitude) {
  HRESULT hr = E_POINTER;
  if (latitude && longitude) {
    hr = result;
    if (SUCCEEDED(hr)) {
      *latitude = 50.0;
      *longitude = -4.0;
    }
  }
  return Leave(hr);
}

STDMETHODIMP ForeignPort::Calculate(double, double) { return S_OK; }

STDMETHODIMP ForeignPort::get_WavePoint(long index, double* v) {
  HRESULT hr = E_POINTER;
  if (v) {
    hr = result;
    if (SUCCEEDED(hr) && (index < 0 || index >= points)) hr = E_INVALIDARG;
    if (SUCCEEDED(hr)) *v = heights.empty() ? height : heights[static_cast<std::size_t>(index) % heights.size()];
  }
  return Leave(hr);
}

}  // namespace br::test
