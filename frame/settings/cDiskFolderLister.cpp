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

namespace br {

bool cDiskFolderLister::Identity(const std::string& folder, FolderIdentity& identity) const {
  // Folders open only with backup semantics; no access right is needed to ask.
  const HANDLE handle = CreateFileA(folder.c_str(), 0, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                                    nullptr, OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr);
  if (handle == INVALID_HANDLE_VALUE) {
    return false;
  }
  BY_HANDLE_FILE_INFORMATION information;
  const bool known = GetFileInformationByHandle(handle, &information) != FALSE;
  CloseHandle(handle);
  if (known) {
    identity.volume = information.dwVolumeSerialNumber;
    identity.index = (static_cast<std::uint64_t>(information.nFileIndexHigh) << 32) | information.nFileIndexLow;
  }
  return known;
}

}  // namespace br
