#pragma once
// Folder listings from the file system, through the platform's directory search.

#include "frame/settings/folder_tree_search.h"

namespace br {

class cDiskFolderLister : public cFolderLister {
public:
  // Folders whose search pattern would not fit MAX_PATH list as empty; this
  // also bounds the depth of a search.
  std::vector<FolderEntry> List(const std::string& folder) const override;
  // The platform's case-blind comparison, for letters beyond ASCII too.
  bool SameName(const std::string& entryName, const std::string& wanted) const override;
  // The volume serial and file index of the folder itself, links followed.
  bool Identity(const std::string& folder, FolderIdentity& identity) const override;
};

}  // namespace br
