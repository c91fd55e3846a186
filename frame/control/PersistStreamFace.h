// IPersistStreamInit (and IPersist) of a control. The controls keep no properties in
// their saved state: the stream holds a version tag and the extent, as containers expect
// something to save and load.
#pragma once

#include "frame/com/Companion.h"

#include <ocidl.h>

namespace br::control {

class ControlCore;

class PersistStreamFace final : public br::com::Companion<IPersistStreamInit> {
public:
  // Bytes of the saved state: version tag, extent width and height (himetric).
  static constexpr ULONG kStateSize = 12;

  PersistStreamFace(IUnknown& owner, ControlCore& core) noexcept : Companion(owner), core_(core) {}

  // The saved state in and out of a stream (shared with IPersistStorage).
  static HRESULT ReadState(ControlCore& core, IStream* stream);
  static HRESULT WriteState(ControlCore& core, IStream* stream);

  STDMETHODIMP GetClassID(CLSID* clsid) override;
  STDMETHODIMP IsDirty() override;
  STDMETHODIMP Load(LPSTREAM stream) override;
  STDMETHODIMP Save(LPSTREAM stream, BOOL clearDirty) override;
  STDMETHODIMP GetSizeMax(ULARGE_INTEGER* size) override;
  STDMETHODIMP InitNew() override;

private:
  ControlCore& core_;
};

}  // namespace br::control
