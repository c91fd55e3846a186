#include "toolkit/core/system_library.h"

#include <string>

namespace toolkit {

HMODULE LoadSystemLibrary(const wchar_t* fileName) {
  if (fileName == nullptr || *fileName == L'\0') return nullptr;
  const std::wstring name(fileName);
  if (name.find_first_of(L"\\/:") != std::wstring::npos) return nullptr;
  std::wstring path(MAX_PATH, L'\0');
  UINT length = GetSystemDirectoryW(&path[0], static_cast<UINT>(path.size()));
  if (length >= path.size()) {
    path.resize(length);
    length = GetSystemDirectoryW(&path[0], static_cast<UINT>(path.size()));
  }
  if (length == 0 || length >= path.size()) return nullptr;
  path.resize(length);
  if (path.back() != L'\\') path += L'\\';
  path += name;
  // A full path is taken from there alone; the DLL's own imports then resolve beside it
  // (the system folder), not in the current folder.
  return LoadLibraryExW(path.c_str(), nullptr, LOAD_WITH_ALTERED_SEARCH_PATH);
}

}  // namespace toolkit
