#include "frame/control/ViewObjectFace.h"

#include "frame/control/ControlCore.h"

namespace br::control {

namespace {

constexpr bool IsDrawableAspect(DWORD aspect) {
  return aspect == DVASPECT_CONTENT || aspect == DVASPECT_OPAQUE || aspect == DVASPECT_TRANSPARENT;
}

}  // namespace

STDMETHODIMP ViewObjectFace::Draw(DWORD aspect, LONG, void*, DVTARGETDEVICE*, HDC, HDC dc, LPCRECTL bounds, LPCRECTL,
                                  BOOL(STDMETHODCALLTYPE*)(ULONG_PTR), ULONG_PTR) {
  if (!IsDrawableAspect(aspect)) return DV_E_DVASPECT;
  // Without bounds only a windowless-active control could draw; these never are.
  if (!dc || !bounds) return E_INVALIDARG;
  const RECT rect{bounds->left, bounds->top, bounds->right, bounds->bottom};
  return core_.DrawInto(dc, rect);
}

STDMETHODIMP ViewObjectFace::GetColorSet(DWORD, LONG, void*, DVTARGETDEVICE*, HDC, LOGPALETTE** colours) {
  if (colours) *colours = nullptr;
  return E_NOTIMPL;
}

STDMETHODIMP ViewObjectFace::Freeze(DWORD, LONG, void*, DWORD*) { return E_NOTIMPL; }
STDMETHODIMP ViewObjectFace::Unfreeze(DWORD) { return E_NOTIMPL; }

STDMETHODIMP ViewObjectFace::SetAdvise(DWORD aspects, DWORD flags, IAdviseSink* sink) {
  sink_ = br::com::ComRef<IAdviseSink>(sink);
  sinkAspects_ = aspects;
  sinkFlags_ = flags;
  if (sink_ && (flags & ADVF_PRIMEFIRST)) NotifyViewChange();
  return S_OK;
}

STDMETHODIMP ViewObjectFace::GetAdvise(DWORD* aspects, DWORD* flags, IAdviseSink** sink) {
  if (aspects) *aspects = sinkAspects_;
  if (flags) *flags = sinkFlags_;
  if (sink) {
    *sink = br::com::ComRef<IAdviseSink>(sink_).Detach();
  }
  return S_OK;
}

STDMETHODIMP ViewObjectFace::GetExtent(DWORD aspect, LONG, DVTARGETDEVICE*, LPSIZEL size) {
  if (aspect != DVASPECT_CONTENT) return DV_E_DVASPECT;
  if (!size) return E_POINTER;
  *size = core_.Extent();
  return S_OK;
}

STDMETHODIMP ViewObjectFace::GetRect(DWORD, LPRECTL) { return E_NOTIMPL; }

STDMETHODIMP ViewObjectFace::GetViewStatus(DWORD* status) {
  if (!status) return E_POINTER;
  *status = VIEWSTATUS_OPAQUE | VIEWSTATUS_SOLIDBKGND;
  return S_OK;
}

STDMETHODIMP ViewObjectFace::QueryHitPoint(DWORD aspect, LPCRECT bounds, POINT location, LONG, DWORD* hit) {
  if (aspect != DVASPECT_CONTENT) return DV_E_DVASPECT;
  if (!bounds || !hit) return E_POINTER;
  *hit = PtInRect(bounds, location) ? HITRESULT_HIT : HITRESULT_OUTSIDE;
  return S_OK;
}

STDMETHODIMP ViewObjectFace::QueryHitRect(DWORD aspect, LPCRECT bounds, LPCRECT location, LONG, DWORD* hit) {
  if (aspect != DVASPECT_CONTENT) return DV_E_DVASPECT;
  if (!bounds || !location || !hit) return E_POINTER;
  RECT common;
  *hit = IntersectRect(&common, bounds, location) ? HITRESULT_HIT : HITRESULT_OUTSIDE;
  return S_OK;
}

STDMETHODIMP ViewObjectFace::GetNaturalExtent(DWORD, LONG, DVTARGETDEVICE*, HDC, DVEXTENTINFO*, LPSIZEL) {
  return E_NOTIMPL;
}

void ViewObjectFace::NotifyViewChange() noexcept {
  if (!sink_) return;
  const br::com::ComRef<IAdviseSink> sink = sink_;
  if (sinkFlags_ & ADVF_ONLYONCE) sink_.Reset();
  sink->OnViewChange(DVASPECT_CONTENT, -1);
}

}  // namespace br::control
