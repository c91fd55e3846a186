#include "frame/control/OleObjectFace.h"

#include "frame/com/ComRef.h"
#include "frame/com/guard.h"
#include "frame/control/ControlCore.h"
#include "frame/control/OwnerHold.h"

#include <cwchar>
#include <string>

namespace br::control {

STDMETHODIMP OleObjectFace::SetClientSite(IOleClientSite* site) { return core_.SetClientSite(site); }

STDMETHODIMP OleObjectFace::GetClientSite(IOleClientSite** site) {
  if (!site) return E_POINTER;
  *site = br::com::ComRef<IOleClientSite>(core_.ClientSite()).Detach();
  return S_OK;
}

STDMETHODIMP OleObjectFace::SetHostNames(LPCOLESTR, LPCOLESTR) { return S_OK; }

STDMETHODIMP OleObjectFace::Close(DWORD saveOption) {
  OwnerHold hold(Owner());
  return br::com::Guarded(core_.Class(), [&] { return core_.Close(saveOption); });
}

STDMETHODIMP OleObjectFace::SetMoniker(DWORD, IMoniker*) { return E_NOTIMPL; }

STDMETHODIMP OleObjectFace::GetMoniker(DWORD, DWORD, IMoniker** moniker) {
  if (moniker) *moniker = nullptr;
  return E_NOTIMPL;
}

STDMETHODIMP OleObjectFace::InitFromData(IDataObject*, BOOL, DWORD) { return E_NOTIMPL; }

STDMETHODIMP OleObjectFace::GetClipboardData(DWORD, IDataObject** data) {
  if (data) *data = nullptr;
  return E_NOTIMPL;
}

STDMETHODIMP OleObjectFace::DoVerb(LONG verb, LPMSG, IOleClientSite* activeSite, LONG, HWND, LPCRECT) {
  OwnerHold hold(Owner());
  return br::com::Guarded(core_.Class(), [&] { return core_.DoVerb(verb, activeSite); });
}

STDMETHODIMP OleObjectFace::EnumVerbs(IEnumOLEVERB** verbs) {
  if (!verbs) return E_POINTER;
  *verbs = nullptr;
  return OleRegEnumVerbs(*core_.Class().clsid, verbs);
}

STDMETHODIMP OleObjectFace::Update() { return S_OK; }
STDMETHODIMP OleObjectFace::IsUpToDate() { return S_OK; }

STDMETHODIMP OleObjectFace::GetUserClassID(CLSID* clsid) {
  if (!clsid) return E_POINTER;
  *clsid = *core_.Class().clsid;
  return S_OK;
}

STDMETHODIMP OleObjectFace::GetUserType(DWORD form, LPOLESTR* userType) {
  if (!userType) return E_POINTER;
  *userType = nullptr;
  if (SUCCEEDED(OleRegGetUserType(*core_.Class().clsid, form, userType)) && *userType) return S_OK;
  // Not registered (a library loaded by path): the name registration would give.
  const std::wstring name = std::wstring(core_.Class().name) + L" Class";
  const std::size_t bytes = (name.size() + 1) * sizeof(wchar_t);
  auto* copy = static_cast<wchar_t*>(CoTaskMemAlloc(bytes));
  if (!copy) return E_OUTOFMEMORY;
  std::wmemcpy(copy, name.c_str(), name.size() + 1);
  *userType = copy;
  return S_OK;
}

STDMETHODIMP OleObjectFace::SetExtent(DWORD aspect, SIZEL* size) {
  if (aspect != DVASPECT_CONTENT) return DV_E_DVASPECT;
  if (!size) return E_POINTER;
  core_.SetExtent(*size);
  core_.Repaint();
  return S_OK;
}

STDMETHODIMP OleObjectFace::GetExtent(DWORD aspect, SIZEL* size) {
  if (aspect != DVASPECT_CONTENT) return DV_E_DVASPECT;
  if (!size) return E_POINTER;
  *size = core_.Extent();
  return S_OK;
}

STDMETHODIMP OleObjectFace::Advise(IAdviseSink* sink, DWORD* connection) {
  if (!sink || !connection) return E_POINTER;
  return core_.Advise(sink, connection);
}

STDMETHODIMP OleObjectFace::Unadvise(DWORD connection) { return core_.Unadvise(connection); }

STDMETHODIMP OleObjectFace::EnumAdvise(IEnumSTATDATA** advise) { return core_.EnumAdvise(advise); }

STDMETHODIMP OleObjectFace::GetMiscStatus(DWORD aspect, DWORD* status) {
  if (!status) return E_POINTER;
  *status = aspect == DVASPECT_CONTENT ? ControlCore::kMiscStatus : 0;
  return S_OK;
}

STDMETHODIMP OleObjectFace::SetColorScheme(LOGPALETTE*) { return E_NOTIMPL; }

}  // namespace br::control
