#include "frame/control/QuickActivateFace.h"

#include "frame/com/ComRef.h"
#include "frame/control/ControlCore.h"

#include <cstddef>
#include <cstring>

namespace br::control {

namespace {

constexpr ULONG kContainerNeeds = offsetof(QACONTAINER, pUnkEventSink) + sizeof(IUnknown*);
constexpr ULONG kControlNeeds = offsetof(QACONTROL, dwPropNotifyCookie) + sizeof(DWORD);

// Connects sink to the control's events; the connection's cookie, or 0.
DWORD ConnectEvents(IUnknown& owner, const IID& events, IUnknown* sink) {
  const auto container = br::com::ComRef<IUnknown>(&owner).Query<IConnectionPointContainer>(IID_IConnectionPointContainer);
  br::com::ComRef<IConnectionPoint> point;
  DWORD cookie = 0;
  if (container && SUCCEEDED(container->FindConnectionPoint(events, point.Out())) && point) {
    if (FAILED(point->Advise(sink, &cookie))) cookie = 0;
  }
  return cookie;
}

}  // namespace

STDMETHODIMP QuickActivateFace::QuickActivate(QACONTAINER* container, QACONTROL* control) {
  if (!container || !control) return E_POINTER;
  if (container->cbSize < kContainerNeeds || control->cbSize < kControlNeeds) return E_INVALIDARG;
  // Fill only as much of the control's record as the container gave room for.
  const ULONG room = control->cbSize < sizeof(QACONTROL) ? control->cbSize : sizeof(QACONTROL);
  std::memset(reinterpret_cast<unsigned char*>(control) + sizeof(control->cbSize), 0, room - sizeof(control->cbSize));

  HRESULT hr = core_.SetClientSite(container->pClientSite);
  if (FAILED(hr)) return hr;
  if (container->pAdviseSink) {
    if (const auto view = br::com::ComRef<IUnknown>(&Owner()).Query<IViewObject>(IID_IViewObject)) {
      view->SetAdvise(DVASPECT_CONTENT, 0, container->pAdviseSink);
    }
  }
  if (container->pUnkEventSink && core_.Class().events) {
    control->dwEventCookie = ConnectEvents(Owner(), *core_.Class().events, container->pUnkEventSink);
  }
  control->dwMiscStatus = ControlCore::kMiscStatus;
  control->dwViewStatus = VIEWSTATUS_OPAQUE | VIEWSTATUS_SOLIDBKGND;
  return S_OK;
}

STDMETHODIMP QuickActivateFace::SetContentExtent(LPSIZEL size) {
  if (!size) return E_POINTER;
  core_.SetExtent(*size);
  return S_OK;
}

STDMETHODIMP QuickActivateFace::GetContentExtent(LPSIZEL size) {
  if (!size) return E_POINTER;
  *size = core_.Extent();
  return S_OK;
}

}  // namespace br::control
