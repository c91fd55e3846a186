#include "tests/wine/portlist/named_port.h"

#include <ocidl.h>

namespace br::test {

STDMETHODIMP NamedPort::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) || IsEqualIID(riid, IID_ITidesPort)) {
    *out = static_cast<ITidesPort*>(this);
    AddRef();
    return S_OK;
  }
  *out = nullptr;
  return E_NOINTERFACE;
}

STDMETHODIMP NamedPort::get_PortName(BSTR* name) {
  if (!name) return E_POINTER;
  *name = SysAllocString(name_.c_str());
  return S_OK;
}

bool SelectSink::Connect(IUnknown* source) {
  IConnectionPointContainer* container = nullptr;
  if (FAILED(source->QueryInterface(IID_IConnectionPointContainer, reinterpret_cast<void**>(&container)))) return false;
  const HRESULT found = container->FindConnectionPoint(DIID__ITidesPortListEvents, &point_);
  container->Release();
  return SUCCEEDED(found) && SUCCEEDED(point_->Advise(this, &cookie_));
}

void SelectSink::Disconnect() {
  if (!point_) return;
  point_->Unadvise(cookie_);
  point_->Release();
  point_ = nullptr;
}

STDMETHODIMP SelectSink::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  if (IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) ||
      IsEqualIID(riid, DIID__ITidesPortListEvents)) {
    *out = this;
    AddRef();
    return S_OK;
  }
  *out = nullptr;
  return E_NOINTERFACE;
}

STDMETHODIMP SelectSink::Invoke(DISPID id, REFIID, LCID, WORD, DISPPARAMS* params, VARIANT*, EXCEPINFO*, UINT*) {
  if (id != 1 || !params || params->cArgs != 1) {
    names.push_back(L"<bad call>");
    return S_OK;
  }
  const VARIANT& argument = params->rgvarg[0];
  types.push_back(argument.vt);
  names.push_back(argument.vt == VT_DISPATCH ? NameOf(argument.pdispVal) : L"<not a dispatch>");
  if (onCall) onCall();
  return S_OK;
}

std::wstring NameOf(IUnknown* port) {
  if (!port) return std::wstring();
  ITidesPort* tides = nullptr;
  if (FAILED(port->QueryInterface(IID_ITidesPort, reinterpret_cast<void**>(&tides)))) return std::wstring();
  BSTR name = nullptr;
  std::wstring out;
  if (SUCCEEDED(tides->get_PortName(&name)) && name) out = name;
  SysFreeString(name);
  tides->Release();
  return out;
}

}  // namespace br::test
