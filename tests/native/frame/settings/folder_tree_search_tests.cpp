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
