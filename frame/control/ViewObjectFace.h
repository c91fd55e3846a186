// IViewObjectEx (with IViewObject2 and IViewObject) of a control: draws the control into
// any device context the container gives, reports its extent, and keeps the one view
// advise sink.
#pragma once

#include "frame/com/ComRef.h"
#include "frame/com/Companion.h"

#include <ocidl.h>

namespace br::control {

class ControlCore;

class ViewObjectFace final : public br::com::Companion<IViewObjectEx> {
public:
  ViewObjectFace(IUnknown& owner, ControlCore& core) noexcept : Companion(owner), core_(core) {}

  // IViewObject
  STDMETHODIMP Draw(DWORD aspect, LONG index, void* aspectInfo, DVTARGETDEVICE* target, HDC targetInfo,
                    HDC dc, LPCRECTL bounds, LPCRECTL metafileBounds, BOOL(STDMETHODCALLTYPE* proceed)(ULONG_PTR),
                    ULONG_PTR proceedArgument) override;
  STDMETHODIMP GetColorSet(DWORD aspect, LONG index, void* aspectInfo, DVTARGETDEVICE* target, HDC targetInfo,
                           LOGPALETTE** colours) override;
  STDMETHODIMP Freeze(DWORD aspect, LONG index, void* aspectInfo, DWORD* freeze) override;
  STDMETHODIMP Unfreeze(DWORD freeze) override;
  STDMETHODIMP SetAdvise(DWORD aspects, DWORD flags, IAdviseSink* sink) override;
  STDMETHODIMP GetAdvise(DWORD* aspects, DWORD* flags, IAdviseSink** sink) override;
  // IViewObject2
  STDMETHODIMP GetExtent(DWORD aspect, LONG index, DVTARGETDEVICE* target, LPSIZEL size) override;
  // IViewObjectEx
  STDMETHODIMP GetRect(DWORD aspect, LPRECTL rect) override;
  STDMETHODIMP GetViewStatus(DWORD* status) override;
  STDMETHODIMP QueryHitPoint(DWORD aspect, LPCRECT bounds, POINT location, LONG closeHint, DWORD* hit) override;
  STDMETHODIMP QueryHitRect(DWORD aspect, LPCRECT bounds, LPCRECT location, LONG closeHint, DWORD* hit) override;
  STDMETHODIMP GetNaturalExtent(DWORD aspect, LONG index, DVTARGETDEVICE* target, HDC targetInfo,
                                DVEXTENTINFO* info, LPSIZEL size) override;

  // Tells the advise sink (if any) that the picture changed.
  void NotifyViewChange() noexcept;

private:
  ControlCore& core_;
  br::com::ComRef<IAdviseSink> sink_;
  DWORD sinkAspects_ = 0;
  DWORD sinkFlags_ = 0;
};

}  // namespace br::control
