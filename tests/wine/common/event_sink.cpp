#include "tests/wine/common/event_sink.h"

#include "BR_Info.h"

namespace br::test {

bool EventSink::Connect(IUnknown* source) {
  IConnectionPointContainer* container = nullptr;
  if (FAILED(source->QueryInterface(IID_IConnectionPointContainer, reinterpret_cast<void**>(&container))))
    return false;
  const HRESULT found = container->FindConnectionPoint(events_, &point_);
  container->Release();
  if (FAILED(found)) return false;
  if (FAILED(point_->Advise(static_cast<IDispatch*>(this), &cookie_))) {
    point_->Release();
    point_ = nullptr;
    return false;
  }
  return true;
}

void EventSink::Disconnect() {
  if (!point_) return;
  IConnectionPoint* point = point_;
  point_ = nullptr;
  point->Unadvise(cookie_);
  point->Release();
}

STDMETHODIMP EventSink::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) || IsEqualIID(riid, events_)) {
    *out = static_cast<IDispatch*>(this);
    AddRef();
    return S_OK;
  }
  *out = nullptr;
  return E_NOINTERFACE;
}

STDMETHODIMP EventSink::GetTypeInfoCount(UINT* count) {
  if (count) *count = 0;
  return S_OK;
}

STDMETHODIMP EventSink::GetTypeInfo(UINT, LCID, ITypeInfo** out) {
  if (out) *out = nullptr;
  return E_NOTIMPL;
}

STDMETHODIMP EventSink::GetIDsOfNames(REFIID, LPOLESTR*, UINT, LCID, DISPID*) { return E_NOTIMPL; }

STDMETHODIMP EventSink::Invoke(DISPID id, REFIID riid, LCID locale, WORD flags, DISPPARAMS* params,
                               VARIANT* result, EXCEPINFO*, UINT*) {
  ++calls;
  lastId = id;
  lastLocale = locale;
  lastFlags = flags;
  lastIidNull = IsEqualIID(riid, IID_NULL) != 0;
  lastDoubles.clear();
  lastArgumentCount = params ? params->cArgs : 0;
  if (params) {
    for (UINT i = params->cArgs; i > 0; --i) {  // DISPPARAMS holds the arguments in reverse
      const VARIANT& v = params->rgvarg[i - 1];
      if (v.vt == VT_R8) lastDoubles.push_back(v.dblVal);
    }
  }
  if (params && params->cArgs > 0) {
    const VARIANT& first = params->rgvarg[params->cArgs - 1];
    argumentTypes.push_back(first.vt);
    if (recordPortNames)
      portNames.push_back(first.vt == VT_DISPATCH || first.vt == VT_UNKNOWN ? PortName(first.punkVal) : L"");
  }
  if (result) result->vt = VT_EMPTY;
  if (onCall) onCall();
  return S_OK;
}

std::wstring PortName(IUnknown* port) {
  ITidesPort* tides = nullptr;
  if (!port || FAILED(port->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&tides)))) return L"";
  BSTR name = nullptr;
  std::wstring out;
  if (SUCCEEDED(tides->get_PortName(&name)) && name) out = name;
  SysFreeString(name);
  tides->Release();
  return out;
}

}  // namespace br::test
