#include "frame/geo/stored_files.h"

#include <wrl/client.h>

#include <new>

using Microsoft::WRL::ComPtr;

namespace br::geo {

namespace {

// One read call asks for at most this much, so a ULONG never overflows.
constexpr ULONG kReadStep = 1u << 20;

}  // namespace

HRESULT ReadStoredFile(IGeoObject* object, const std::wstring& name, std::string& bytes, bool& stored) {
  stored = false;
  bytes.clear();
  if (object == nullptr) return E_POINTER;
  if (name.empty() || name.find(L'\0') != std::wstring::npos) return STG_E_FILENOTFOUND;
  ComPtr<IStorage> storage;
  HRESULT hr = object->GetStorage(&storage);
  if (FAILED(hr)) return hr;
  if (!storage) return STG_E_FILENOTFOUND;
  ComPtr<IStream> stream;
  hr = storage->OpenStream(name.c_str(), nullptr, STGM_READ | STGM_SHARE_EXCLUSIVE, 0, &stream);
  if (FAILED(hr)) return hr;
  if (!stream) return STG_E_FILENOTFOUND;
  stored = true;
  return ReadWholeStream(stream.Get(), bytes);
}

HRESULT ReadWholeStream(IStream* stream, std::string& bytes, std::uint64_t limit) {
  bytes.clear();
  if (stream == nullptr) return E_POINTER;
  ULARGE_INTEGER end{};
  LARGE_INTEGER zero{};
  HRESULT hr = stream->Seek(zero, STREAM_SEEK_END, &end);
  if (FAILED(hr)) return hr;
  hr = stream->Seek(zero, STREAM_SEEK_SET, nullptr);
  if (FAILED(hr)) return hr;
  if (end.QuadPart > limit) return E_OUTOFMEMORY;
  const auto size = static_cast<std::size_t>(end.QuadPart);
  try {
    bytes.assign(size, '\0');
  } catch (const std::bad_alloc&) {
    return E_OUTOFMEMORY;
  }
  std::size_t have = 0;
  while (have < size) {
    const std::size_t left = size - have;
    const ULONG want = left < kReadStep ? static_cast<ULONG>(left) : kReadStep;
    ULONG read = 0;
    hr = stream->Read(&bytes[have], want, &read);
    if (FAILED(hr) || read == 0 || read > want) break;
    have += read;
  }
  if (have == size) return S_OK;
  bytes.clear();
  return FAILED(hr) ? hr : STG_E_READFAULT;
}

HRESULT ReadWholeFile(const std::string& path, std::string& bytes, std::uint64_t limit) {
  bytes.clear();
  HANDLE file = CreateFileA(path.c_str(), GENERIC_READ, FILE_SHARE_READ, nullptr, OPEN_EXISTING,
                            FILE_ATTRIBUTE_NORMAL, nullptr);
  if (file == INVALID_HANDLE_VALUE) return HRESULT_FROM_WIN32(GetLastError());
  struct Closer {
    HANDLE file;
    ~Closer() { CloseHandle(file); }
  } closer{file};
  LARGE_INTEGER size{};
  if (!GetFileSizeEx(file, &size)) return HRESULT_FROM_WIN32(GetLastError());
  if (size.QuadPart < 0 || static_cast<std::uint64_t>(size.QuadPart) > limit) return E_OUTOFMEMORY;
  try {
    bytes.assign(static_cast<std::size_t>(size.QuadPart), '\0');
  } catch (const std::bad_alloc&) {
    return E_OUTOFMEMORY;
  }
  std::size_t have = 0;
  while (have < bytes.size()) {
    const std::size_t left = bytes.size() - have;
    const DWORD want = left < kReadStep ? static_cast<DWORD>(left) : kReadStep;
    DWORD read = 0;
    if (!ReadFile(file, &bytes[have], want, &read, nullptr)) {
      const HRESULT hr = HRESULT_FROM_WIN32(GetLastError());
      bytes.clear();
      return hr;
    }
    if (read == 0) break;  // the file got shorter since its size was taken
    have += read;
  }
  bytes.resize(have);
  return S_OK;
}

}  // namespace br::geo
