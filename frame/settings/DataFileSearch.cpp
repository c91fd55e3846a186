#include "frame/settings/DataFileSearch.h"

#include <vector>

#include "frame/settings/Settings.h"

namespace {

std::string JoinPath(const std::string& folder, const char* name) {
  std::string path = folder;
  if (path.empty() || path.back() != '\\') {
    path += '\\';
  }
  path += name;
  return path;
}

// Closes the search handle on every way out.
class FileSearch {
public:
  explicit FileSearch(const std::string& pattern)
      : m_handle(FindFirstFileA(pattern.c_str(), &m_entry)) {}
  ~FileSearch() {
    if (m_handle != INVALID_HANDLE_VALUE) {
      FindClose(m_handle);
    }
  }
  FileSearch(const FileSearch&) = delete;
  FileSearch& operator=(const FileSearch&) = delete;

  bool HasEntry() const { return m_handle != INVALID_HANDLE_VALUE && m_valid; }
  const WIN32_FIND_DATAA& Entry() const { return m_entry; }
  void Next() { m_valid = FindNextFileA(m_handle, &m_entry) != FALSE; }

private:
  WIN32_FIND_DATAA m_entry{};
  HANDLE m_handle;
  bool m_valid = true;
};

bool IsWantedFile(const WIN32_FIND_DATAA& entry, const char* fileName) {
  const DWORD attributes = entry.dwFileAttributes;
  return (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0 &&
         (attributes & FILE_ATTRIBUTE_ARCHIVE) != 0 && (attributes & FILE_ATTRIBUTE_HIDDEN) == 0 &&
         lstrcmpiA(entry.cFileName, fileName) == 0;
}

bool IsSubfolder(const WIN32_FIND_DATAA& entry) {
  return (entry.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0 && entry.cFileName[0] != '.';
}

// The registry keeps these folders with one closing character (normally the
// backslash) that is not part of the folder.
HRESULT SearchConfiguredFolder(std::string folder, const char* fileName, std::string& path) {
  if (folder.empty()) {
    return REGDB_E_READREGDB;
  }
  folder.pop_back();
  return FindFileInTree(folder, fileName, path);
}

}  // namespace

HRESULT FindFileInTree(const std::string& folder, const char* fileName, std::string& path) {
  if (folder.empty() || fileName == nullptr || *fileName == '\0') {
    return E_FAIL;
  }
  const std::string pattern = JoinPath(folder, "*.*");
  // The ANSI file functions stop at MAX_PATH; this also bounds the recursion.
  if (pattern.size() >= MAX_PATH) {
    return E_FAIL;
  }
  std::vector<std::string> subfolders;
  for (FileSearch search(pattern); search.HasEntry(); search.Next()) {
    const WIN32_FIND_DATAA& entry = search.Entry();
    if (IsWantedFile(entry, fileName)) {
      path = JoinPath(folder, entry.cFileName);
      return S_OK;
    }
    if (IsSubfolder(entry)) {
      subfolders.emplace_back(entry.cFileName);
    }
  }
  for (const std::string& name : subfolders) {
    if (FindFileInTree(JoinPath(folder, name.c_str()), fileName, path) == S_OK) {
      return S_OK;
    }
  }
  return E_FAIL;
}

HRESULT FindVolumeFile(const std::string& databaseName, const char* fileName, std::string& path) {
  return SearchConfiguredFolder(ReadVolumeFolder(databaseName), fileName, path);
}

HRESULT FindStoreFile(const char* fileName, std::string& path) {
  return SearchConfiguredFolder(ReadBasesStore(), fileName, path);
}
