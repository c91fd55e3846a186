#include "frame/geo/GeodesyLibrary.h"

#include <vector>

namespace br::geo {

namespace {

constexpr long kMaxDatumName = 256;

bool IsAbsolute(const std::wstring& folder) {
  const bool drive = folder.size() >= 3 && folder[1] == L':' && (folder[2] == L'\\' || folder[2] == L'/');
  const bool share = folder.size() >= 3 && folder[0] == L'\\' && folder[1] == L'\\';
  return drive || share;
}

std::wstring FolderOf(HMODULE module) {
  std::wstring path(MAX_PATH, L'\0');
  for (;;) {
    const DWORD length = GetModuleFileNameW(module, &path[0], static_cast<DWORD>(path.size()));
    if (length == 0) return std::wstring();
    if (length < path.size()) {
      path.resize(length);
      break;
    }
    path.resize(path.size() * 2);
  }
  const std::size_t slash = path.find_last_of(L"\\/");
  return slash == std::wstring::npos ? std::wstring() : path.substr(0, slash);
}

template <typename F>
F Entry(HMODULE module, const char* name) {
  return reinterpret_cast<F>(reinterpret_cast<void*>(GetProcAddress(module, name)));
}

GeodesyLibrary* sharedLibrary = nullptr;

}  // namespace

GeodesyLibrary::GeodesyLibrary(const std::vector<std::wstring>& folders) {
  for (const std::wstring& folder : folders) {
    if (!IsAbsolute(folder)) continue;
    std::wstring path = folder;
    if (path.back() != L'\\' && path.back() != L'/') path += L'\\';
    path += FILE_NAME;
    if (GetFileAttributesW(path.c_str()) == INVALID_FILE_ATTRIBUTES) continue;
    // A full path is loaded from there alone; its own dependencies resolve beside it.
    HMODULE module = LoadLibraryExW(path.c_str(), nullptr, LOAD_WITH_ALTERED_SEARCH_PATH);
    if (module == nullptr) continue;
    module_ = module;
    path_ = path;
    datumName_ = Entry<DatumNameFunction>(module, "GetGeodeticDatumTypeName");
    degrees_ = Entry<DegreesFunction>(module, "nrm2deg");
    init_ = Entry<InitFunction>(module, "TMapMetrics__init");
    clear_ = Entry<ClearFunction>(module, "TMapMetrics__clear");
    return;
  }
}

GeodesyLibrary::~GeodesyLibrary() {
  if (module_ != nullptr) FreeLibrary(module_);
}

std::string GeodesyLibrary::DatumName(long code) const {
  if (datumName_ == nullptr) return std::string();
  std::vector<char> buffer(kMaxDatumName + 1, '\0');
  datumName_(code, buffer.data(), kMaxDatumName);
  buffer[kMaxDatumName] = '\0';
  return std::string(buffer.data());
}

std::optional<double> GeodesyLibrary::Degrees(long normalised) const {
  if (degrees_ == nullptr) return std::nullopt;
  return degrees_(normalised);
}

bool GeodesyLibrary::WithMapMetrics(const std::function<void(GEO_MAP_METRICS*)>& hitTest) const {
  if (init_ == nullptr || clear_ == nullptr) return false;
  GEO_MAP_METRICS metrics{};
  init_(&metrics, 0);
  try {
    hitTest(&metrics);
  } catch (...) {
    clear_(&metrics);
    throw;
  }
  clear_(&metrics);
  return true;
}

std::vector<std::wstring> GeodesyLibrary::KnownFolders() {
  HMODULE self = nullptr;
  GetModuleHandleExW(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                     reinterpret_cast<LPCWSTR>(&sharedLibrary), &self);
  std::vector<std::wstring> folders;
  if (self != nullptr) folders.push_back(FolderOf(self));
  folders.push_back(FolderOf(nullptr));
  return folders;
}

const GeodesyLibrary& GeodesyLibrary::Shared() {
  if (sharedLibrary == nullptr) sharedLibrary = new GeodesyLibrary(KnownFolders());
  return *sharedLibrary;
}

void GeodesyLibrary::ReleaseShared() {
  GeodesyLibrary* library = sharedLibrary;
  sharedLibrary = nullptr;
  delete library;
}

}  // namespace br::geo
