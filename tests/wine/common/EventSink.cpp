#include "tests/wine/common/EventSink.h"

#include "BR_Info.h"

namespace br::test {

bool EventSink::Connect(IUnknown* source) {
  const auto container = br::com::ComRef<IUnknown>(source).Query<IConnectionPointContainer>(IID_IConnectionPointContainer);
  if (!container || FAILED(container->FindConnectionPoint(events_, point_.Out()))) return false;
  if (FAILED(point_->Advise(static_cast<IDispatch*>(this), &cookie_))) {
    point_.Reset();
    return false;
  }
  return true;
}

void EventSink::Disconnect() {
  const br::com::ComRef<IConnectionPoint> point = std::move(point_);
  if (point) point->Unadvise(cookie_);
}

STDMETHODIMP EventSink::QueryInterface(REFIID riid, void** out) {
  if (!out) return E_POINTER;
  const bool ours = IsEqualIID(riid, IID_IUnknown) || IsEqualIID(riid, IID_IDispatch) || IsEqualIID(riid, events_);
  *out = ours ? static_cast<IDispatch*>(this) : nullptr;
  return ours ? (AddRef(), S_OK) : E_NOINTERFACE;
}

STDMETHODIMP EventSink::Invoke(DISPID id, REFIID riid, LCID locale, WORD flags, DISPPARAMS* params,
                               VARIANT* result, EXCEPINFO*, UINT*) {
  ++calls;
  lastId = id;
  lastLocale = locale;
  lastFlags = flags;
  lastIidNull = IsEqualIID(riid, IID_NULL) != 0;
  lastDoubles.clear();
  lastArgumentCount = params ? params->cArgs : 0;
  for (UINT i = lastArgumentCount; i > 0; --i)  // DISPPARAMS holds the arguments in reverse
    if (params->rgvarg[i - 1].vt == VT_R8) lastDoubles.push_back(params->rgvarg[i - 1].dblVal);
  if (lastArgumentCount > 0) {
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
  const auto tides = br::com::ComRef<IUnknown>(port).Query<ITidesPort>(IID_ITidesPort);
  BSTR name = nullptr;
  const std::wstring out = tides && SUCCEEDED(tides->get_PortName(&name)) && name ? name : L"";
  return SysFreeString(name), out;
}

}  // namespace br::test
