// Registry settings and the data file search against the prefix's real
// registry and file system.
#include <doctest/doctest.h>

#include <string>

#include "tests/wine/common/registry_test_support.h"
#include "frame/errors/cErr.h"
#include "frame/settings/data_file_search.h"
#include "frame/settings/settings.h"
#include "frame/settings/cRegKeyReader.h"
#include "frame/settings/cRegSettings.h"

using namespace br;

static void MakeFile(const std::string& path, DWORD attributes = FILE_ATTRIBUTE_ARCHIVE) {
  WriteTextFile(path, "picture");
  REQUIRE(SetFileAttributesA(path.c_str(), attributes));
}

TEST_CASE("the simple key reader throws 0xE0030002 without a key") {
  const cRegKeyReader missing(HKEY_LOCAL_MACHINE, "SOFTWARE\\Brine\\NoSuchKey\\AtAll");
  CHECK_FALSE(missing.IsOpen());
  DWORD number = 0;
  std::string text;
  const auto codeOf = [](auto read) {
    try {
      read();
    } catch (const cErr& error) {
      return error.code();
    }
    return 0u;
  };
  CHECK(codeOf([&] { missing.ReadDword("LogBRCL", number); }) == 0xE0030002u);
  CHECK(codeOf([&] { missing.ReadString("LogFileBRCL", text, 520); }) == 0xE0030002u);
  // Reads through an open key: the log settings rows of the Wine errors suite.
}

TEST_CASE("settings: strings read whole, dwords, other types as absent, the picture window placement") {
  const std::string enumKey = cRegSettings::FullPath(SETTINGS_ENUM_KEY);
  SavedRegistryValue treeMode(HKEY_LOCAL_MACHINE, enumKey, SETTING_TREE_MODE);
  SavedRegistryValue keyPath(HKEY_LOCAL_MACHINE, enumKey, SETTING_KEY_PATH);
  treeMode.SetString("1");
  CHECK(ReadTreeMode() == 0);
  treeMode.SetDword(2);
  CHECK(ReadTreeMode() == 2);
  const std::string longText(5000, 'q');
  keyPath.SetString(longText);
  CHECK(ReadKeyPath() == longText);
  keyPath.SetString("%TEMP%", REG_EXPAND_SZ);
  CHECK(ReadKeyPath().empty());
  keyPath.Set(REG_SZ, "abc", 3);  // a string value stored without its terminator is read whole
  CHECK(ReadKeyPath() == "abc");
  const std::string boxKey = cRegSettings::FullPath(SETTINGS_PICTURE_BOX_KEY);
  SavedRegistryValue left(HKEY_CURRENT_USER, boxKey, "left"), top(HKEY_CURRENT_USER, boxKey, "top");
  SavedRegistryValue right(HKEY_CURRENT_USER, boxKey, "right"), bottom(HKEY_CURRENT_USER, boxKey, "bottom");
  REQUIRE(WritePictureBoxPlacement(RECT{-120, 40, 500, 380}));
  const RECT placement = ReadPictureBoxPlacement();
  CHECK((placement.left == -120 && placement.top == 40 && placement.right == 500 && placement.bottom == 380));
  right.SetString("7");
  CHECK(ReadPictureBoxPlacement().right == 0);
}

// The search rules are the native folder search suite's; here the real lister under them.
TEST_CASE("volume and store files are searched below their registry folders: own files first, hidden ones skipped") {
  ScratchFolder volume;
  REQUIRE(CreateDirectoryA((volume / "PICS").c_str(), nullptr));
  MakeFile(volume / "PICS\\shoal.tif");
  MakeFile(volume / "Shoal.tif", FILE_ATTRIBUTE_ARCHIVE | FILE_ATTRIBUTE_HIDDEN);
  const std::string enumKey = cRegSettings::FullPath(SETTINGS_ENUM_KEY);
  const std::string database = "BrTestDb" + std::to_string(GetCurrentProcessId());
  std::string path;
  {
    SavedRegistryValue folder(HKEY_LOCAL_MACHINE, enumKey + "\\" + database + "\\Volumes\\00", "");
    folder.SetString(volume.Path() + "*");  // the last character goes whatever it is
    REQUIRE(FindVolumeFile(database, "SHOAL.TIF", path) == S_OK);
    CHECK(path == volume / "PICS\\shoal.tif");
    folder.SetString("");
    CHECK(FindVolumeFile(database, "shoal.tif", path) == REGDB_E_READREGDB);
  }
  RegDeleteTreeA(HKEY_LOCAL_MACHINE, (enumKey + "\\" + database).c_str());
  CHECK(FindVolumeFile(database, "shoal.tif", path) == REGDB_E_READREGDB);

  SavedRegistryValue store(HKEY_LOCAL_MACHINE, enumKey, SETTING_BASES_STORE);
  store.SetString(volume.Path() + "\\");  // no doubled backslash
  REQUIRE(FindStoreFile("shoal.tif", path) == S_OK);
  CHECK(path == volume / "PICS\\shoal.tif");
  REQUIRE(SetFileAttributesA((volume / "Shoal.tif").c_str(), FILE_ATTRIBUTE_ARCHIVE));
  REQUIRE(FindStoreFile("shoal.tif", path) == S_OK);
  CHECK(path == volume / "Shoal.tif");
  store.Delete();
  CHECK(FindStoreFile("shoal.tif", path) == REGDB_E_READREGDB);
}

TEST_CASE("folder links: two links to their own folder end the search at once; the file past them is found") {
  ScratchFolder volume;
  const std::string root = volume / "V";
  REQUIRE(CreateDirectoryA(root.c_str(), nullptr));
  struct LinkTreeCleanup {  // before the scratch folder's own delete, which would meet the links
    std::string root;
    ~LinkTreeCleanup() { RemoveTreeWithLinks(root); }
  } cleanup{root};
  REQUIRE(CreateDirectoryA((root + "\\loop").c_str(), nullptr));
  REQUIRE(CreateDirectoryA((root + "\\zz").c_str(), nullptr));
  REQUIRE(MakeFolderLink(root + "\\loop\\a", root + "\\loop"));
  REQUIRE(MakeFolderLink(root + "\\loop\\b", root + "\\loop"));
  REQUIRE(MakeFolderLink(root + "\\zz\\up", root));
  MakeFile(root + "\\zz\\pic.png");

  std::string path;
  const ULONGLONG start = GetTickCount64();
  const HRESULT found = FindFileInTree(root, "PIC.PNG", path);
  const HRESULT missing = FindFileInTree(root, "absent.png", path);
  // Without the guard the links double the listings per level (minutes); a hang detector.
  CHECK(GetTickCount64() - start < 2000);
  CHECK(found == S_OK);
  CHECK(missing == E_FAIL);
  CHECK(path == root + "\\zz\\pic.png");
}

TEST_CASE("a database name that is empty or holds a backslash reads no volume folder") {
  ScratchFolder volume;
  MakeFile(volume / "chart.txt");
  const std::string enumKey = cRegSettings::FullPath(SETTINGS_ENUM_KEY);
  // Folders that the two names would reach if they were put into the registry path.
  SavedRegistryValue empty(HKEY_LOCAL_MACHINE, enumKey + "\\\\Volumes\\00", "");
  SavedRegistryValue nested(HKEY_LOCAL_MACHINE, enumKey + "\\BrTestA\\BrTestB\\Volumes\\00", "");
  empty.SetString(volume.Path() + "\\");
  nested.SetString(volume.Path() + "\\");
  std::string path = "unchanged";
  CHECK(FindVolumeFile("", "chart.txt", path) == REGDB_E_READREGDB);
  CHECK(FindVolumeFile("BrTestA\\BrTestB", "chart.txt", path) == REGDB_E_READREGDB);
  CHECK(path == "unchanged");
  empty.Delete();
  nested.Delete();
  RegDeleteTreeA(HKEY_LOCAL_MACHINE, (enumKey + "\\BrTestA").c_str());
}
