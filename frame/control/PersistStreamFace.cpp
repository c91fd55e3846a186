#include "frame/control/PersistStreamFace.h"

#include "frame/control/ControlCore.h"

#include <cstdint>

namespace br::control {

namespace {

constexpr std::uint32_t kStateTag = 0x31435242;  // "BRC1"

void PutLittleEndian(unsigned char* out, std::uint32_t value) {
  for (int i = 0; i < 4; ++i) out[i] = static_cast<unsigned char>(value >> (8 * i));
}

std::uint32_t GetLittleEndian(const unsigned char* in) {
  std::uint32_t value = 0;
  for (int i = 0; i < 4; ++i) value |= static_cast<std::uint32_t>(in[i]) << (8 * i);
  return value;
}

}  // namespace

HRESULT PersistStreamFace::ReadState(ControlCore& core, IStream* stream) {
  if (!stream) return E_POINTER;
  unsigned char bytes[kStateSize] = {};
  ULONG read = 0;
  const HRESULT hr = stream->Read(bytes, kStateSize, &read);
  if (FAILED(hr)) return hr;
  if (read != kStateSize || GetLittleEndian(bytes) != kStateTag) return E_FAIL;
  const auto width = static_cast<std::int32_t>(GetLittleEndian(bytes + 4));
  const auto height = static_cast<std::int32_t>(GetLittleEndian(bytes + 8));
  if (width < 0 || height < 0) return E_FAIL;
  core.SetExtent(SIZEL{width, height});
  core.SetDirty(false);
  return S_OK;
}

HRESULT PersistStreamFace::WriteState(ControlCore& core, IStream* stream) {
  if (!stream) return E_POINTER;
  const SIZEL extent = core.Extent();
  unsigned char bytes[kStateSize];
  PutLittleEndian(bytes, kStateTag);
  PutLittleEndian(bytes + 4, static_cast<std::uint32_t>(extent.cx));
  PutLittleEndian(bytes + 8, static_cast<std::uint32_t>(extent.cy));
  ULONG written = 0;
  const HRESULT hr = stream->Write(bytes, kStateSize, &written);
  if (FAILED(hr)) return hr;
  return written == kStateSize ? S_OK : STG_E_MEDIUMFULL;
}

STDMETHODIMP PersistStreamFace::GetClassID(CLSID* clsid) {
  if (!clsid) return E_POINTER;
  *clsid = *core_.Class().clsid;
  return S_OK;
}

STDMETHODIMP PersistStreamFace::IsDirty() { return core_.Dirty() ? S_OK : S_FALSE; }

STDMETHODIMP PersistStreamFace::Load(LPSTREAM stream) { return ReadState(core_, stream); }

STDMETHODIMP PersistStreamFace::Save(LPSTREAM stream, BOOL clearDirty) {
  const HRESULT hr = WriteState(core_, stream);
  if (SUCCEEDED(hr) && clearDirty) core_.SetDirty(false);
  return hr;
}

STDMETHODIMP PersistStreamFace::GetSizeMax(ULARGE_INTEGER* size) {
  if (!size) return E_POINTER;
  size->QuadPart = kStateSize;
  return S_OK;
}

STDMETHODIMP PersistStreamFace::InitNew() { return S_OK; }

}  // namespace br::control
