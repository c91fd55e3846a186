#include <doctest/doctest.h>

#include <map>
#include <string>
#include <vector>

#include "frame/settings/FolderTreeSearch.h"

namespace {

FolderEntry File(const char* name, bool archive = true, bool hidden = false) {
  FolderEntry entry;
  entry.name = name;
  entry.archive = archive;
  entry.hidden = hidden;
  return entry;
}

FolderEntry Folder(const char* name) {
  FolderEntry entry;
  entry.name = name;
  entry.isFolder = true;
  return entry;
}

// A folder tree held in memory; folders it does not know list as empty.
class FakeTree : public cFolderLister {
public:
  std::vector<FolderEntry> List(const std::string& folder) const override {
    listed.push_back(folder);
    const auto found = folders.find(folder);
    return found == folders.end() ? std::vector<FolderEntry>() : found->second;
  }

  std::map<std::string, std::vector<FolderEntry>> folders;
  mutable std::vector<std::string> listed;
};

}  // namespace

TEST_CASE("a folder's own files come before its subfolders, subfolders in listing order") {
  FakeTree tree;
  tree.folders["C:\\Store"] = {Folder("."), Folder(".."), Folder("b"), Folder("a"),
                               File("other.bmp"), File("Wreck.BMP")};
  tree.folders["C:\\Store\\b"] = {Folder("deep"), File("x.png")};
  tree.folders["C:\\Store\\b\\deep"] = {File("wreck.bmp"), File("y.png")};
  tree.folders["C:\\Store\\a"] = {File("y.png")};
  std::string path;

  REQUIRE(SearchFolderTree(tree, "C:\\Store", "wreck.bmp", path));
  CHECK(path == "C:\\Store\\Wreck.BMP");
  CHECK(tree.listed == std::vector<std::string>{"C:\\Store"});

  // "b" is listed before "a", and its whole subtree is searched before "a".
  // A closing backslash on the folder is not doubled.
  tree.folders["C:\\Store\\"] = tree.folders["C:\\Store"];
  tree.listed.clear();
  REQUIRE(SearchFolderTree(tree, "C:\\Store\\", "Y.PNG", path));
  CHECK(path == "C:\\Store\\b\\deep\\y.png");
  CHECK(tree.listed ==
        std::vector<std::string>{"C:\\Store\\", "C:\\Store\\b", "C:\\Store\\b\\deep"});
}

TEST_CASE("files without the archive attribute, hidden files and dot folders are passed over") {
  FakeTree tree;
  tree.folders["D:\\V"] = {File("pic.bmp", false), Folder(".cache"), Folder("sub")};
  tree.folders["D:\\V\\.cache"] = {File("pic.bmp")};
  tree.folders["D:\\V\\sub"] = {File("pic.bmp", true, true), Folder("pic.bmp"), Folder("more")};
  tree.folders["D:\\V\\sub\\more"] = {File("PIC.bmp", false)};
  std::string path = "unchanged";
  CHECK_FALSE(SearchFolderTree(tree, "D:\\V", "pic.bmp", path));
  CHECK(path == "unchanged");

  // Setting the archive attribute makes the deepest copy findable.
  tree.folders["D:\\V\\sub\\more"][0].archive = true;
  REQUIRE(SearchFolderTree(tree, "D:\\V", "pic.bmp", path));
  CHECK(path == "D:\\V\\sub\\more\\PIC.bmp");
  tree.folders["D:\\V"][0].archive = true;
  REQUIRE(SearchFolderTree(tree, "D:\\V", "pic.bmp", path));
  CHECK(path == "D:\\V\\pic.bmp");
}

TEST_CASE("names match whole and without regard to ASCII letter case") {
  FakeTree tree;
  tree.folders["E:"] = {File("chart.bmp.bak"), File("hart.bmp"), File("CHART.bmp")};
  std::string path;
  REQUIRE(SearchFolderTree(tree, "E:", "chart.BMP", path));
  CHECK(path == "E:\\CHART.bmp");
  CHECK_FALSE(SearchFolderTree(tree, "E:", "chart", path));
  CHECK_FALSE(tree.SameName("a", "b"));
}

TEST_CASE("no folder, no name or an unreadable folder finds nothing") {
  FakeTree tree;
  tree.folders[""] = {File("a.bmp")};
  std::string path;
  tree.folders["F:\\x"] = {File("")};
  CHECK_FALSE((SearchFolderTree(tree, "", "a.bmp", path) || SearchFolderTree(tree, "F:\\missing", "a.bmp", path) ||
               SearchFolderTree(tree, "F:\\x", "", path)));
  CHECK((JoinFolderPath("F:\\", "a") == "F:\\a" && JoinFolderPath("F:", "a") == "F:\\a"));
}
