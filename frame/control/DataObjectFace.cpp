#include "frame/control/DataObjectFace.h"

#include "frame/control/ControlCore.h"

#include <shlobj.h>

namespace br::control {

namespace {

bool IsContentFormat(const FORMATETC& format, CLIPFORMAT clipFormat, DWORD medium) {
  return format.cfFormat == clipFormat && format.dwAspect == DVASPECT_CONTENT && (format.tymed & medium);
}

HRESULT CheckFormat(const FORMATETC& format) {
  if (format.dwAspect != DVASPECT_CONTENT) return DV_E_DVASPECT;
  if (format.cfFormat == CF_ENHMETAFILE) return (format.tymed & TYMED_ENHMF) ? S_OK : DV_E_TYMED;
  if (format.cfFormat == CF_METAFILEPICT) return (format.tymed & TYMED_MFPICT) ? S_OK : DV_E_TYMED;
  return DV_E_FORMATETC;
}

}  // namespace

STDMETHODIMP DataObjectFace::GetData(FORMATETC* format, STGMEDIUM* medium) {
  if (!format || !medium) return E_POINTER;
  const HRESULT check = CheckFormat(*format);
  if (FAILED(check)) return check;
  const SIZEL himetric = core_.Extent();
  const SIZE pixels = core_.ExtentInPixels();
  const RECT bounds{0, 0, pixels.cx, pixels.cy};

  if (IsContentFormat(*format, CF_ENHMETAFILE, TYMED_ENHMF)) {
    const RECT frame{0, 0, himetric.cx, himetric.cy};
    HDC dc = CreateEnhMetaFileW(nullptr, nullptr, &frame, nullptr);
    if (!dc) return E_OUTOFMEMORY;
    const HRESULT hr = core_.DrawInto(dc, bounds);
    HENHMETAFILE picture = CloseEnhMetaFile(dc);
    if (FAILED(hr) || !picture) {
      if (picture) DeleteEnhMetaFile(picture);
      return FAILED(hr) ? hr : E_OUTOFMEMORY;
    }
    medium->tymed = TYMED_ENHMF;
    medium->hEnhMetaFile = picture;
    medium->pUnkForRelease = nullptr;
    return S_OK;
  }

  HDC dc = CreateMetaFileW(nullptr);
  if (!dc) return E_OUTOFMEMORY;
  SetWindowOrgEx(dc, 0, 0, nullptr);
  SetWindowExtEx(dc, pixels.cx, pixels.cy, nullptr);
  const HRESULT hr = core_.DrawInto(dc, bounds);
  HMETAFILE picture = CloseMetaFile(dc);
  if (FAILED(hr) || !picture) {
    if (picture) DeleteMetaFile(picture);
    return FAILED(hr) ? hr : E_OUTOFMEMORY;
  }
  HGLOBAL global = GlobalAlloc(GMEM_MOVEABLE, sizeof(METAFILEPICT));
  auto* description = global ? static_cast<METAFILEPICT*>(GlobalLock(global)) : nullptr;
  if (!description) {
    if (global) GlobalFree(global);
    DeleteMetaFile(picture);
    return E_OUTOFMEMORY;
  }
  description->mm = MM_ANISOTROPIC;
  description->xExt = himetric.cx;
  description->yExt = himetric.cy;
  description->hMF = picture;
  GlobalUnlock(global);
  medium->tymed = TYMED_MFPICT;
  medium->hMetaFilePict = global;
  medium->pUnkForRelease = nullptr;
  return S_OK;
}

STDMETHODIMP DataObjectFace::GetDataHere(FORMATETC*, STGMEDIUM*) { return E_NOTIMPL; }

STDMETHODIMP DataObjectFace::QueryGetData(FORMATETC* format) {
  if (!format) return E_POINTER;
  return CheckFormat(*format);
}

STDMETHODIMP DataObjectFace::GetCanonicalFormatEtc(FORMATETC* in, FORMATETC* out) {
  if (!in || !out) return E_POINTER;
  *out = *in;
  out->ptd = nullptr;
  return DATA_S_SAMEFORMATETC;
}

STDMETHODIMP DataObjectFace::SetData(FORMATETC*, STGMEDIUM*, BOOL) { return E_NOTIMPL; }

STDMETHODIMP DataObjectFace::EnumFormatEtc(DWORD direction, IEnumFORMATETC** formats) {
  if (!formats) return E_POINTER;
  *formats = nullptr;
  if (direction != DATADIR_GET) return E_NOTIMPL;
  FORMATETC offered[2] = {
      {CF_ENHMETAFILE, nullptr, DVASPECT_CONTENT, -1, TYMED_ENHMF},
      {CF_METAFILEPICT, nullptr, DVASPECT_CONTENT, -1, TYMED_MFPICT},
  };
  return SHCreateStdEnumFmtEtc(2, offered, formats);
}

STDMETHODIMP DataObjectFace::DAdvise(FORMATETC* format, DWORD flags, IAdviseSink* sink, DWORD* connection) {
  if (!format || !sink || !connection) return E_POINTER;
  if (!holder_) {
    const HRESULT hr = CreateDataAdviseHolder(holder_.Out());
    if (FAILED(hr)) return hr;
  }
  return holder_->Advise(this, format, flags, sink, connection);
}

STDMETHODIMP DataObjectFace::DUnadvise(DWORD connection) {
  if (!holder_) return OLE_E_NOCONNECTION;
  return holder_->Unadvise(connection);
}

STDMETHODIMP DataObjectFace::EnumDAdvise(IEnumSTATDATA** advise) {
  if (!advise) return E_POINTER;
  *advise = nullptr;
  if (!holder_) return S_OK;
  return holder_->EnumAdvise(advise);
}

void DataObjectFace::NotifyDataChange() noexcept {
  if (holder_) holder_->SendOnDataChange(this, 0, 0);
}

}  // namespace br::control
