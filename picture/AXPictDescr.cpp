#include "picture/AXPictDescr.h"

#include "frame/com/ComRef.h"
#include "frame/geo/volume_files.h"
#include "frame/settings/data_file_search.h"
#include "picture/logic/picture_list.h"
#include "toolkit/base/class_records.h"

#include <cstdio>
#include <memory>

namespace br::picture {

namespace {

constexpr ULONG kBlock = 1024;
// A stored picture larger than this is not copied whole (the copy stops here).
constexpr ULONGLONG kCopyCap = 256ull << 20;

std::wstring Wide(const std::string& text, UINT codePage) {
  if (text.empty()) return {};
  const int n = MultiByteToWideChar(codePage, 0, text.data(), static_cast<int>(text.size()), nullptr, 0);
  std::wstring out(n > 0 ? n : 0, L'\0');
  if (n > 0) MultiByteToWideChar(codePage, 0, text.data(), static_cast<int>(text.size()), out.data(), n);
  return out;
}

std::string Narrow(const wchar_t* text, UINT len, UINT codePage) {
  if (!text || len == 0) return {};
  const int n = WideCharToMultiByte(codePage, 0, text, static_cast<int>(len), nullptr, 0, nullptr, nullptr);
  std::string out(n > 0 ? n : 0, '\0');
  if (n > 0) WideCharToMultiByte(codePage, 0, text, static_cast<int>(len), out.data(), n, nullptr, nullptr);
  return out;
}

// A fresh folder of this component's own: never one an earlier process left behind.
std::wstring MakeOwnFolder() {
  static unsigned next = 0;
  wchar_t temp[MAX_PATH + 1] = {};
  const DWORD n = GetTempPathW(MAX_PATH + 1, temp);
  if (n == 0 || n > MAX_PATH) return {};
  const std::wstring base = std::wstring(temp) + L"PICREP\\";
  CreateDirectoryW(base.c_str(), nullptr);
  for (int attempt = 0; attempt < 1000; ++attempt) {
    const std::wstring folder =
        base + std::to_wstring(GetCurrentProcessId()) + L"_" + std::to_wstring(next++) + L"\\";
    if (CreateDirectoryW(folder.c_str(), nullptr)) return folder;
    if (GetLastError() != ERROR_ALREADY_EXISTS) return {};
  }
  return {};
}

// Deletes what the folder holds and the folder. A link inside is removed itself, its
// target left alone.
void DeleteTree(const std::wstring& folder) {
  WIN32_FIND_DATAW entry;
  const HANDLE find = FindFirstFileW((folder + L"*").c_str(), &entry);
  if (find != INVALID_HANDLE_VALUE) {
    do {
      const std::wstring name = entry.cFileName;
      if (name == L"." || name == L"..") continue;
      const std::wstring path = folder + name;
      if (entry.dwFileAttributes & FILE_ATTRIBUTE_READONLY)
        SetFileAttributesW(path.c_str(), entry.dwFileAttributes & ~FILE_ATTRIBUTE_READONLY);
      if (!(entry.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY)) {
        DeleteFileW(path.c_str());
      } else {
        if (!(entry.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT)) {
          DeleteTree(path + L"\\");
        } else if (!RemoveDirectoryW(path.c_str()) && !DeleteFileW(path.c_str())) {
          // The link itself, opened as a link, goes when closed.
          const HANDLE link = CreateFileW(path.c_str(), DELETE, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                                          nullptr, OPEN_EXISTING,
                                          FILE_FLAG_OPEN_REPARSE_POINT | FILE_FLAG_BACKUP_SEMANTICS |
                                              FILE_FLAG_DELETE_ON_CLOSE,
                                          nullptr);
          if (link != INVALID_HANDLE_VALUE) CloseHandle(link);
        }
      }
    } while (FindNextFileW(find, &entry));
    FindClose(find);
  }
  RemoveDirectoryW(folder.c_str());
}

// The attribute's text as UTF-8; empty when the object has none or it is no text.
std::string NamesOf(IGeoObject* object) {
  br::com::ComRef<IGeoAttribute> attribute;
  if (object->GetAttribute(kPictureAttribute, attribute.Out()) != S_OK || !attribute) return {};
  VARIANT value;
  VariantInit(&value);
  std::string names;
  if (SUCCEEDED(attribute->GetValue(&value)) && value.vt == VT_BSTR)
    names = Narrow(value.bstrVal, SysStringLen(value.bstrVal), CP_UTF8);
  VariantClear(&value);
  return names;
}

}  // namespace

void SetDefaultShading(IXPICREPView* view) {
  if (!view) return;
  for (ULONG palette = 0; palette < 5; ++palette) view->SetPalIdxShading(palette, kDefaultShading[palette]);
}

AXPictDescr::AXPictDescr() : folder_(MakeOwnFolder()) { AXComponent::create(CLSID_XPICREPView); }

AXPictDescr::~AXPictDescr() {
  // The view keeps its file open: let go of it before the files go.
  RemovePicture();
  if (!folder_.empty()) DeleteTree(folder_);
}

const toolkit::ClassRecord* AXPictDescr::getClassRecord() const { return &toolkit::records::cXPictDescr_AXPictDescr; }

bool AXPictDescr::create(HWND parentHwnd) {
  if (!AXComponent::create(parentHwnd)) return false;
  const auto view = br::com::ComRef<IXPICREPView>::Adopt(View());
  SetDefaultShading(view.Get());
  return true;
}

IXPICREPView* AXPictDescr::View() const {
  IXPICREPView* view = nullptr;
  if (FAILED(getControl(IID_IXPICREPView, reinterpret_cast<void**>(&view)))) return nullptr;
  return view;
}

void AXPictDescr::RemovePicture() {
  const auto view = br::com::ComRef<IXPICREPView>::Adopt(View());
  if (!view) return;
  VARIANT empty;
  VariantInit(&empty);
  view->put_Property(PRV_PICFILENAME, empty);
}

HRESULT AXPictDescr::Fill(IGeoObject* object) {
  if (!object) return E_POINTER;
  return FillNames(object, NamesOf(object));
}

HRESULT AXPictDescr::FillNames(IGeoObject* object, const std::string& names) {
  RemovePicture();
  // Files of the last fill are no longer shown: make room.
  if (!folder_.empty()) {
    DeleteTree(folder_);
    CreateDirectoryW(folder_.c_str(), nullptr);
  }
  paths_.clear();
  shown_ = false;
  current_ = -1;

  br::com::ComRef<IStorage> storage;
  if (object && (FAILED(object->GetStorage(storage.Out())) || !storage)) storage.Reset();
  for (const std::string& name : SplitPictureNames(names)) {
    bool stored = false;
    if (storage) {
      const HRESULT hr = AddStored(storage.Get(), Wide(name, CP_UTF8), stored);
      if (FAILED(hr)) return hr;
    }
    if (stored) continue;
    const HRESULT hr = AddFound(object, name);
    if (FAILED(hr)) return hr;
  }
  current_ = -1;
  return S_OK;
}

HRESULT AXPictDescr::AddStored(IStorage* storage, const std::wstring& name, bool& stored) {
  stored = false;
  br::com::ComRef<IStream> stream;
  // Compound files refuse STGM_READ alone: the share mode must be exclusive.
  if (FAILED(storage->OpenStream(name.c_str(), nullptr, STGM_READ | STGM_SHARE_EXCLUSIVE, 0, stream.Out())) ||
      !stream)
    return S_OK;
  stored = true;
  wchar_t path[MAX_PATH] = {};
  if (folder_.empty() || !GetTempFileNameW(folder_.c_str(), L"TIF", 0, path)) return kPictureNotCopied;
  ULONGLONG left = kCopyCap;
  STATSTG status{};
  // Streams answer S_OK with 0 bytes at their end: one that ends before the size it told
  // has lost part of the picture, and a cut picture is no copy.
  const bool sized = SUCCEEDED(stream->Stat(&status, STATFLAG_NONAME)) && status.cbSize.QuadPart < left;
  if (sized) left = status.cbSize.QuadPart;

  bool copied = false;
  if (FILE* file = _wfopen(path, L"wb")) {
    copied = true;
    unsigned char block[kBlock];
    while (left > 0) {
      ULONG read = 0;
      const ULONG want = left < kBlock ? static_cast<ULONG>(left) : kBlock;
      if (FAILED(stream->Read(block, want, &read))) {
        copied = false;
        break;
      }
      if (read == 0) break;
      if (std::fwrite(block, 1, read, file) != read) {
        copied = false;
        break;
      }
      left -= read;
    }
    if (sized && left > 0) copied = false;
    if (std::fclose(file) != 0) copied = false;
  }
  if (!copied) {
    DeleteFileW(path);
    return kPictureNotCopied;
  }
  paths_.push_back(path);
  return S_OK;
}

HRESULT AXPictDescr::AddFound(IGeoObject* object, const std::string& name) {
  // The folder searches take names in the ANSI code page.
  const std::wstring wide = Wide(name, CP_UTF8);
  const std::string ansi = Narrow(wide.data(), static_cast<UINT>(wide.size()), CP_ACP);
  std::string path;
  bool found = false;
  br::com::ComRef<IGeoDatabase> database;
  if (object && SUCCEEDED(br::geo::DatabaseOfObject(object, database.Out())) && database)
    found = br::geo::FindVolumeFile(database.Get(), ansi.c_str(), path) == S_OK;
  if (!found) found = br::FindStoreFile(ansi.c_str(), path) == S_OK;
  if (!found) return kPictureNotFound;
  paths_.push_back(Wide(path, CP_ACP));
  return S_OK;
}

HRESULT AXPictDescr::Show(int index) {
  const auto view = br::com::ComRef<IXPICREPView>::Adopt(View());
  if (!view) return E_NOTIMPL;
  if (index < 0) return S_FALSE;
  current_ = index;
  VARIANT name;
  name.vt = VT_BSTR;
  name.bstrVal = SysAllocString(paths_[static_cast<size_t>(index)].c_str());
  if (!name.bstrVal) return E_OUTOFMEMORY;
  const HRESULT hr = view->put_Property(PRV_PICFILENAME, name);
  VariantClear(&name);
  shown_ = SUCCEEDED(hr);
  return hr;
}

HRESULT AXPictDescr::Next() {
  if (!isHosting()) return E_NOTIMPL;
  return Show(NextIndex(current_, Count()));
}

HRESULT AXPictDescr::Previous() {
  if (!isHosting()) return E_NOTIMPL;
  return Show(PreviousIndex(current_, Count()));
}

HRESULT AXPictDescr::SetZoom(long percent) {
  const auto view = br::com::ComRef<IXPICREPView>::Adopt(View());
  if (!view) return E_NOTIMPL;
  VARIANT zoom;
  zoom.vt = VT_I4;
  zoom.lVal = percent;
  return view->put_Property(PRV_ZOOMPERCENT, zoom);
}

}  // namespace br::picture
