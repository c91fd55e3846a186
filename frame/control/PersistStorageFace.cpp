#include "frame/control/PersistStorageFace.h"

#include "frame/com/ComRef.h"
#include "frame/control/ControlCore.h"

namespace br::control {

namespace {

constexpr const wchar_t* kStreamName = L"Contents";

}  // namespace

STDMETHODIMP PersistStorageFace::GetClassID(CLSID* clsid) {
  if (!clsid) return E_POINTER;
  *clsid = *core_.Class().clsid;
  return S_OK;
}

STDMETHODIMP PersistStorageFace::IsDirty() { return core_.Dirty() ? S_OK : S_FALSE; }

STDMETHODIMP PersistStorageFace::InitNew(IStorage* storage) { return storage ? S_OK : E_POINTER; }

STDMETHODIMP PersistStorageFace::Load(IStorage* storage) {
  if (!storage) return E_POINTER;
  br::com::ComRef<IStream> stream;
  const HRESULT hr = storage->OpenStream(kStreamName, nullptr, STGM_READ | STGM_SHARE_EXCLUSIVE, 0, stream.Out());
  if (FAILED(hr)) return hr;
  return PersistStreamFace::ReadState(core_, stream.Get());
}

STDMETHODIMP PersistStorageFace::Save(IStorage* storage, BOOL) {
  if (!storage) return E_POINTER;
  br::com::ComRef<IStream> stream;
  const HRESULT hr =
      storage->CreateStream(kStreamName, STGM_CREATE | STGM_WRITE | STGM_SHARE_EXCLUSIVE, 0, 0, stream.Out());
  if (FAILED(hr)) return hr;
  return PersistStreamFace::WriteState(core_, stream.Get());
}

STDMETHODIMP PersistStorageFace::SaveCompleted(IStorage*) {
  core_.SetDirty(false);
  return S_OK;
}

STDMETHODIMP PersistStorageFace::HandsOffStorage() { return S_OK; }

}  // namespace br::control
