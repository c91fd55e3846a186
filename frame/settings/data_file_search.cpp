#include "frame/settings/data_file_search.h"

#include "frame/settings/settings.h"
#include "frame/settings/cDiskFolderLister.h"

namespace br {

namespace {

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
  if (fileName == nullptr) {
    return E_FAIL;
  }
  return SearchFolderTree(cDiskFolderLister(), folder, fileName, path) ? S_OK : E_FAIL;
}

HRESULT FindVolumeFile(const std::string& databaseName, const char* fileName, std::string& path) {
  // The name becomes part of a registry path: an empty one would read the Enum key's
  // own subtree, a backslash would step into another key.
  if (databaseName.empty() || databaseName.find('\\') != std::string::npos) {
    return REGDB_E_READREGDB;
  }
  return SearchConfiguredFolder(ReadVolumeFolder(databaseName), fileName, path);
}

HRESULT FindStoreFile(const char* fileName, std::string& path) {
  return SearchConfiguredFolder(ReadBasesStore(), fileName, path);
}

}  // namespace br
