#include "host/brdesk/DispatchSink.h"

namespace br::brdesk {

bool DispatchSink::Connect(IUnknown* source) {
  Disconnect();
  IConnectionPointContainer* container = nullptr;
  if (!source || FAILED(source->QueryInterface(IID_IConnectionPointContainer, reinterpret_cast<void**>(&container)))) {
    return false;
  }
  const HRESULT found = container->FindConnectionPoint(events_, &point_);
  container->Release();
  if (FAILED(found) || !point_) return false;
  if (FAILED(point_->Advise(this, &cookie_))) {
    point_->Release();
    point_ = nullptr;
    return false;
  }
  return true;
}

void DispatchSink::Disconnect() {
  if (!point_) return;
  point_->Unadvise(cookie_);
  point_->Release();
  point_ = nullptr;
}

STDMETHODIMP DispatchSink::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) || IsEqualIID(riid, events_)) {
    *out = static_cast<IDispatch*>(this);
    AddRef();
    return S_OK;
  }
  *out = nullptr;
  return E_NOINTERFACE;
}

STDMETHODIMP DispatchSink::GetTypeInfoCount(UINT* count) {
  if (!count) return E_POINTER;
  *count = 0;
  return S_OK;
}

STDMETHODIMP DispatchSink::Invoke(DISPID id, REFIID, LCID, WORD, DISPPARAMS* params, VARIANT*, EXCEPINFO*, UINT*) {
  if (params && handler_) handler_(id, *params);
  return S_OK;
}

}  // namespace br::brdesk
