#pragma once
// Depth-first search of a folder tree for a file, over any folder listing:
// a folder's own files before its subfolders, subfolders in listing order.
// Only files with the archive attribute and without the hidden attribute
// count; names compare without regard to letter case; folders whose names
// begin with a dot are not entered.
//
// Folder links can make a tree loop (a link to the folder itself, or to a parent):
// each folder is entered once, known by its identity (volume serial and file
// index), and never deeper than MAX_SEARCH_DEPTH levels below the start.

#include <cstdint>
#include <string>
#include <vector>

namespace br {

struct FolderEntry {
  std::string name;
  bool isFolder = false;
  bool archive = false;
  bool hidden = false;
};

// Where a folder lives on disk: the same for every path (link) that reaches it.
struct FolderIdentity {
  std::uint32_t volume = 0;
  std::uint64_t index = 0;
};

inline constexpr int MAX_SEARCH_DEPTH = 64;

class cFolderLister {
public:
  virtual ~cFolderLister() = default;
  // Every entry of the folder in the platform's order; an unreadable folder is empty.
  virtual std::vector<FolderEntry> List(const std::string& folder) const = 0;
  // Case-blind name comparison; the default knows ASCII letters only.
  virtual bool SameName(const std::string& entryName, const std::string& wanted) const;
  // False when the folder's identity cannot be read; it is then searched without
  // being remembered (the depth limit still holds).
  virtual bool Identity(const std::string& folder, FolderIdentity& identity) const;
};

// folder + "\" + name, without doubling a closing backslash.
std::string JoinFolderPath(const std::string& folder, const std::string& name);

// True with the full path of the first match.
bool SearchFolderTree(const cFolderLister& lister, const std::string& folder,
                      const std::string& fileName, std::string& path);

}  // namespace br
