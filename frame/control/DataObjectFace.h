// IDataObject of a control: its picture as an enhanced metafile (CF_ENHMETAFILE) or a
// metafile picture (CF_METAFILEPICT), drawn at the control's extent.
#pragma once

#include "frame/com/ComRef.h"
#include "frame/com/Companion.h"

#include <objidl.h>

namespace br::control {

class ControlCore;

class DataObjectFace final : public br::com::Companion<IDataObject> {
public:
  DataObjectFace(IUnknown& owner, ControlCore& core) noexcept : Companion(owner), core_(core) {}

  STDMETHODIMP GetData(FORMATETC* format, STGMEDIUM* medium) override;
  STDMETHODIMP GetDataHere(FORMATETC* format, STGMEDIUM* medium) override;
  STDMETHODIMP QueryGetData(FORMATETC* format) override;
  STDMETHODIMP GetCanonicalFormatEtc(FORMATETC* in, FORMATETC* out) override;
  STDMETHODIMP SetData(FORMATETC* format, STGMEDIUM* medium, BOOL release) override;
  STDMETHODIMP EnumFormatEtc(DWORD direction, IEnumFORMATETC** formats) override;
  STDMETHODIMP DAdvise(FORMATETC* format, DWORD flags, IAdviseSink* sink, DWORD* connection) override;
  STDMETHODIMP DUnadvise(DWORD connection) override;
  STDMETHODIMP EnumDAdvise(IEnumSTATDATA** advise) override;

  // Tells the data advise sinks that the picture changed.
  void NotifyDataChange() noexcept;

private:
  ControlCore& core_;
  br::com::ComRef<IDataAdviseHolder> holder_;
};

}  // namespace br::control
