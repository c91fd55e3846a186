// The folder search rules in memory; the Wine settings suite's volume and store searches run the real lister.
#include <doctest/doctest.h>

#include <map>
#include <string>
#include <vector>

#include "frame/settings/folder_tree_search.h"

using namespace br;

namespace {

FolderEntry File(const char* name, bool archive = true) { return {name, false, archive}; }
FolderEntry Folder(const char* name) { return {name, true}; }

// A folder tree held in memory; folders it does not know list as empty.
struct FakeTree : cFolderLister {
  std::vector<FolderEntry> List(const std::string& folder) const override {
    listed.push_back(folder);
    const auto found = folders.find(folder);
    return found == folders.end() ? std::vector<FolderEntry>() : found->second;
  }
  std::map<std::string, std::vector<FolderEntry>> folders;
  mutable std::vector<std::string> listed;
};

}  // namespace

TEST_CASE("subfolders in listing order, each subtree whole; whole names only; no archive bit, dot folders, no name: nothing") {
  FakeTree tree;
  tree.folders["C:\\Store"] = {Folder("."), Folder(".."), Folder("b"), Folder("a"), File("y.png.bak")};
  tree.folders["C:\\Store\\b"] = {Folder("deep"), File("x.png")};
  tree.folders["C:\\Store\\b\\deep"] = {File("y.png")};
  tree.folders["C:\\Store\\a"] = {File("y.png")};
  std::string path;
  REQUIRE(SearchFolderTree(tree, "C:\\Store", "Y.PNG", path));
  CHECK(path == "C:\\Store\\b\\deep\\y.png");
  CHECK(tree.listed == std::vector<std::string>{"C:\\Store", "C:\\Store\\b", "C:\\Store\\b\\deep"});

  tree.folders["D:\\V"] = {File("pic.bmp", false), Folder(".cache"), Folder("sub")};
  tree.folders["D:\\V\\.cache"] = {File("pic.bmp")};
  tree.folders["D:\\V\\sub"] = {Folder("pic.bmp")};
  tree.folders[""] = {File("a.bmp")};
  tree.folders["F:\\x"] = {File("")};
  path = "unchanged";
  CHECK_FALSE((SearchFolderTree(tree, "C:\\Store", "y", path) || SearchFolderTree(tree, "D:\\V", "pic.bmp", path)));
  CHECK_FALSE((SearchFolderTree(tree, "", "a.bmp", path) || SearchFolderTree(tree, "F:\\x", "", path)));
  CHECK(path == "unchanged");
  tree.folders["D:\\V"][0].archive = true;
  REQUIRE(SearchFolderTree(tree, "D:\\V", "pic.bmp", path));
  CHECK(path == "D:\\V\\pic.bmp");
}

namespace {

// A tree whose folders have identities: a path that ends in a link names its target's.
struct LinkedTree : FakeTree {
  bool Identity(const std::string& folder, FolderIdentity& identity) const override {
    std::string target = folder;
    for (bool changed = true; changed;) {
      changed = false;
      for (const auto& [link, to] : links) {
        if (target.size() >= link.size() && target.compare(0, link.size(), link) == 0 &&
            (target.size() == link.size() || target[link.size()] == '\\')) {
          target = to + target.substr(link.size());
          changed = true;
        }
      }
    }
    identity.volume = 7;
    identity.index = std::hash<std::string>()(target);
    return true;
  }
  std::vector<FolderEntry> List(const std::string& folder) const override {
    FolderIdentity identity;
    Identity(folder, identity);
    for (const auto& [path, entries] : folders) {
      FolderIdentity other;
      Identity(path, other);
      if (other.index == identity.index) {
        listed.push_back(folder);
        return entries;
      }
    }
    listed.push_back(folder);
    return {};
  }
  std::vector<std::pair<std::string, std::string>> links;  // link path -> target path
};

}  // namespace

TEST_CASE("folder links: every folder is searched once, however many links reach it") {
  // Two links to the folder itself: without identities the listing count doubles per level.
  LinkedTree tree;
  tree.folders["C:\\V"] = {Folder("loop"), Folder("z")};
  tree.folders["C:\\V\\loop"] = {Folder("a"), Folder("b"), File("other.png")};
  tree.folders["C:\\V\\z"] = {Folder("up"), File("pic.png")};
  tree.links = {{"C:\\V\\loop\\a", "C:\\V\\loop"}, {"C:\\V\\loop\\b", "C:\\V\\loop"}, {"C:\\V\\z\\up", "C:\\V"}};
  std::string path;
  REQUIRE(SearchFolderTree(tree, "C:\\V", "pic.png", path));
  CHECK(path == "C:\\V\\z\\pic.png");
  CHECK(tree.listed == std::vector<std::string>{"C:\\V", "C:\\V\\loop", "C:\\V\\z"});

  tree.listed.clear();
  CHECK_FALSE(SearchFolderTree(tree, "C:\\V", "absent.png", path));
  CHECK(tree.listed.size() == 3);  // the links lead back to folders already searched
}

TEST_CASE("without identities the depth limit ends a search through links") {
  // A folder whose only subfolder leads to itself, seen only by its ever longer path.
  struct EndlessTree : cFolderLister {
    std::vector<FolderEntry> List(const std::string& folder) const override {
      ++listings;
      deepest = folder;
      return {{"again", true}};
    }
    mutable int listings = 0;
    mutable std::string deepest;
  } tree;
  std::string path;
  CHECK_FALSE(SearchFolderTree(tree, "C:\\V", "pic.png", path));
  CHECK(tree.listings == MAX_SEARCH_DEPTH + 1);
  CHECK(tree.deepest.size() == std::string("C:\\V").size() + MAX_SEARCH_DEPTH * std::string("\\again").size());
}
