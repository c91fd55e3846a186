#include "frame/settings/cDiskFolderLister.h"

#include <windows.h>

namespace br {

std::vector<FolderEntry> cDiskFolderLister::List(const std::string& folder) const {
  std::vector<FolderEntry> entries;
  const std::string pattern = JoinFolderPath(folder, "*.*");
  if (pattern.size() >= MAX_PATH) {
    return entries;
  }
  WIN32_FIND_DATAA found;
  const HANDLE search = FindFirstFileA(pattern.c_str(), &found);
  if (search == INVALID_HANDLE_VALUE) {
    return entries;
  }
  do {
    FolderEntry entry;
    entry.name = found.cFileName;
    entry.isFolder = (found.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
    entry.archive = (found.dwFileAttributes & FILE_ATTRIBUTE_ARCHIVE) != 0;
    entry.hidden = (found.dwFileAttributes & FILE_ATTRIBUTE_HIDDEN) != 0;
    entries.push_back(std::move(entry));
  } while (FindNextFileA(search, &found));
  FindClose(search);
  return entries;
}

bool cDiskFolderLister::SameName(const std::string& entryName, const std::string& wanted) const {
  return lstrcmpiA(entryName.c_str(), wanted.c_str()) == 0;
}

}  // namespace br
