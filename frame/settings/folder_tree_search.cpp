#include "frame/settings/folder_tree_search.h"

#include <set>
#include <utility>

namespace br {

namespace {

char LowerAscii(char c) { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }

using VisitedFolders = std::set<std::pair<std::uint32_t, std::uint64_t>>;

bool SearchFolder(const cFolderLister& lister, const std::string& folder, const std::string& fileName,
                  int depth, VisitedFolders& visited, std::string& path) {
  FolderIdentity identity;
  if (lister.Identity(folder, identity) && !visited.insert({identity.volume, identity.index}).second) {
    return false;  // reached again through a link: searched already
  }
  std::vector<std::string> subfolders;
  for (const FolderEntry& entry : lister.List(folder)) {
    if (entry.isFolder) {
      if (!entry.name.empty() && entry.name[0] != '.') {
        subfolders.push_back(entry.name);
      }
    } else if (entry.archive && !entry.hidden && lister.SameName(entry.name, fileName)) {
      path = JoinFolderPath(folder, entry.name);
      return true;
    }
  }
  if (depth >= MAX_SEARCH_DEPTH) {
    return false;
  }
  for (const std::string& name : subfolders) {
    if (SearchFolder(lister, JoinFolderPath(folder, name), fileName, depth + 1, visited, path)) {
      return true;
    }
  }
  return false;
}

}  // namespace

bool cFolderLister::Identity(const std::string&, FolderIdentity&) const { return false; }

bool cFolderLister::SameName(const std::string& entryName, const std::string& wanted) const {
  if (entryName.size() != wanted.size()) {
    return false;
  }
  for (std::size_t i = 0; i < wanted.size(); ++i) {
    if (LowerAscii(entryName[i]) != LowerAscii(wanted[i])) {
      return false;
    }
  }
  return true;
}

std::string JoinFolderPath(const std::string& folder, const std::string& name) {
  std::string path = folder;
  if (path.empty() || path.back() != '\\') {
    path += '\\';
  }
  path += name;
  return path;
}

bool SearchFolderTree(const cFolderLister& lister, const std::string& folder,
                      const std::string& fileName, std::string& path) {
  if (folder.empty() || fileName.empty()) {
    return false;
  }
  VisitedFolders visited;
  return SearchFolder(lister, folder, fileName, 0, visited, path);
}

}  // namespace br
