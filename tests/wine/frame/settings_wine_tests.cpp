// Registry settings and the data file search against the prefix's real
// registry and file system.
#include <doctest/doctest.h>

#include <string>

#include "TestSupport.h"
#include "frame/settings/DataFileSearch.h"
#include "frame/settings/Settings.h"
#include "frame/errors/cErr.h"
#include "frame/settings/cRegKeyReader.h"
#include "frame/settings/cRegSettings.h"

namespace {

// A scratch subkey below SOFTWARE\Brine, removed with everything under it.
class ScratchSubkey {
public:
  explicit ScratchSubkey(HKEY root)
      : m_root(root), m_name("BrTest" + std::to_string(GetCurrentProcessId())) {}
  ~ScratchSubkey() { RegDeleteTreeA(m_root, cRegSettings::FullPath(m_name.c_str()).c_str()); }
  const char* Name() const { return m_name.c_str(); }
  std::string Sub(const char* child) const { return m_name + "\\" + child; }
  std::string FullPath() const { return cRegSettings::FullPath(m_name.c_str()); }

private:
  HKEY m_root;
  std::string m_name;
};

void MakeFile(const std::string& path, DWORD attributes = FILE_ATTRIBUTE_ARCHIVE) {
  WriteTextFile(path, "picture");
  REQUIRE(SetFileAttributesA(path.c_str(), attributes));
}

void MakeFolder(const std::string& path) { REQUIRE(CreateDirectoryA(path.c_str(), nullptr)); }

// The first and second subfolder names as the platform lists them.
std::pair<std::string, std::string> ListedOrder(const ScratchFolder& root) {
  std::string names[2];
  int count = 0;
  WIN32_FIND_DATAA entry;
  HANDLE search = FindFirstFileA((root / "*.*").c_str(), &entry);
  REQUIRE(search != INVALID_HANDLE_VALUE);
  do {
    if ((entry.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) && entry.cFileName[0] != '.' &&
        count < 2) {
      names[count++] = entry.cFileName;
    }
  } while (FindNextFileA(search, &entry));
  FindClose(search);
  REQUIRE(count == 2);
  return {names[0], names[1]};
}

}  // namespace

TEST_CASE("dword settings: written keys are created, other types read as absent") {
  for (HKEY root : {HKEY_LOCAL_MACHINE, HKEY_CURRENT_USER}) {
    const cRegSettings settings(root);
    const ScratchSubkey scratch(root);
    const std::string deep = scratch.Sub("Deep\\Er");
    CHECK(settings.ReadDword(deep.c_str(), "Count", 17) == 17);  // no key yet
    REQUIRE(settings.WriteDword(deep.c_str(), "Count", 0xFFFFFFFEu));  // the key is made
    CHECK(settings.ReadDword(deep.c_str(), "Count", 17) == 0xFFFFFFFEu);
    CHECK(settings.ReadDword(deep.c_str(), "Missing", 3) == 3);

    const std::string full = cRegSettings::FullPath(deep.c_str());
    SavedRegistryValue value(root, full, "Typed");
    value.SetString("5");
    CHECK(settings.ReadDword(deep.c_str(), "Typed", 9) == 9);
    value.SetDword(5);
    CHECK(settings.ReadDword(deep.c_str(), "Typed", 9) == 5);
  }
}

TEST_CASE("string settings are read whole; other types and missing values give the default") {
  const cRegSettings settings = cRegSettings::Machine();
  const ScratchSubkey scratch(HKEY_LOCAL_MACHINE);
  const std::string full = scratch.FullPath();
  SavedRegistryValue value(HKEY_LOCAL_MACHINE, full, "Folder");
  SavedRegistryValue unnamed(HKEY_LOCAL_MACHINE, full, "");

  value.SetString("C:\\Charts\\");
  CHECK(settings.ReadString(scratch.Name(), "Folder", "dflt") == "C:\\Charts\\");
  const std::string longText(5000, 'q');
  value.SetString(longText);
  CHECK(settings.ReadString(scratch.Name(), "Folder", "dflt") == longText);
  value.SetString("");
  CHECK(settings.ReadString(scratch.Name(), "Folder", "dflt").empty());
  value.SetString("%TEMP%", REG_EXPAND_SZ);
  CHECK(settings.ReadString(scratch.Name(), "Folder", "dflt") == "dflt");
  // Bytes that look like text are still not a string value.
  value.SetBinary({'a', 'b', 0});
  CHECK(settings.ReadString(scratch.Name(), "Folder", "dflt") == "dflt");
  CHECK(settings.ReadString("NoSuchKey\\AtAll", "Folder", "dflt") == "dflt");

  unnamed.SetString("D:\\Vol\\");
  CHECK(settings.ReadString(scratch.Name(), nullptr, "") == "D:\\Vol\\");

  // A string value stored without its terminator is read whole.
  HKEY key = nullptr;
  REQUIRE(RegCreateKeyExA(HKEY_LOCAL_MACHINE, scratch.FullPath().c_str(), 0, nullptr, 0,
                          KEY_SET_VALUE, nullptr, &key, nullptr) == ERROR_SUCCESS);
  const char raw[] = {'a', 'b', 'c'};
  RegSetValueExA(key, "Raw", 0, REG_SZ, reinterpret_cast<const BYTE*>(raw), sizeof raw);
  RegCloseKey(key);
  CHECK(cRegSettings::Machine().ReadString(scratch.Name(), "Raw", "dflt") == "abc");
}

TEST_CASE("the simple key reader throws 0xE0030002 without a key and limits string lengths") {
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

  const ScratchSubkey scratch(HKEY_LOCAL_MACHINE);
  SavedRegistryValue value(HKEY_LOCAL_MACHINE, scratch.FullPath(), "Text");
  value.SetString(std::string(9, 'z'));  // 10 bytes with the terminator
  const cRegKeyReader reader(HKEY_LOCAL_MACHINE, scratch.FullPath().c_str());
  REQUIRE(reader.IsOpen());
  CHECK(reader.ReadString("Text", text, 10));
  CHECK(text == std::string(9, 'z'));
  CHECK_FALSE(reader.ReadString("Text", text, 9));
  CHECK_FALSE(reader.ReadDword("Text", number));
  value.SetDword(77);
  CHECK(reader.ReadDword("Text", number));
  CHECK(number == 77);
  CHECK_FALSE(reader.ReadString("Text", text, 10));
}

TEST_CASE("the settings table: tree mode, key path and the picture window placement") {
  const std::string enumKey = cRegSettings::FullPath(SETTINGS_ENUM_KEY);
  SavedRegistryValue treeMode(HKEY_LOCAL_MACHINE, enumKey, SETTING_TREE_MODE);
  SavedRegistryValue keyPath(HKEY_LOCAL_MACHINE, enumKey, SETTING_KEY_PATH);

  treeMode.SetString("1");
  CHECK(ReadTreeMode() == 0);
  treeMode.SetDword(2);
  CHECK(ReadTreeMode() == 2);
  treeMode.Delete();
  CHECK(ReadTreeMode() == 0);

  keyPath.SetString("C:\\Brine\\Data\\");
  CHECK(ReadKeyPath() == "C:\\Brine\\Data\\");
  keyPath.Delete();
  CHECK(ReadKeyPath().empty());
  // The volume folder is read by the volume file case below.

  const std::string boxKey = cRegSettings::FullPath(SETTINGS_PICTURE_BOX_KEY);
  SavedRegistryValue left(HKEY_CURRENT_USER, boxKey, "left");
  SavedRegistryValue top(HKEY_CURRENT_USER, boxKey, "top");
  SavedRegistryValue right(HKEY_CURRENT_USER, boxKey, "right");
  SavedRegistryValue bottom(HKEY_CURRENT_USER, boxKey, "bottom");
  REQUIRE(WritePictureBoxPlacement(RECT{-120, 40, 500, 380}));
  const RECT placement = ReadPictureBoxPlacement();
  CHECK(std::to_string(placement.left) + "," + std::to_string(placement.top) + "," +
            std::to_string(placement.right) + "," + std::to_string(placement.bottom) ==
        "-120,40,500,380");
  right.SetString("7");
  CHECK(ReadPictureBoxPlacement().right == 0);
}

// The search rules are the native folder search suite's; here the real lister under them.
TEST_CASE("folder search on the real file system: own files first, depth-first, hidden and dot entries skipped") {
  ScratchFolder root;
  MakeFolder(root / "one");
  MakeFolder(root / "two");
  const auto [first, second] = ListedOrder(root);
  MakeFolder(root / (first + "\\deeper"));
  MakeFile(root / (first + "\\deeper\\Mark.PNG"));
  MakeFile(root / (second + "\\mark.png"));
  MakeFile(root / (second + "\\chart.bmp"));
  std::string path;
  REQUIRE(FindFileInTree(root.Path() + "\\", "mark.png", path) == S_OK);  // no doubled backslash
  CHECK(path == root / (first + "\\deeper\\Mark.PNG"));
  const std::string top = root / "CHART.bmp";
  MakeFile(top, FILE_ATTRIBUTE_ARCHIVE | FILE_ATTRIBUTE_HIDDEN);
  REQUIRE((GetFileAttributesA(top.c_str()) & FILE_ATTRIBUTE_HIDDEN) != 0);
  REQUIRE(FindFileInTree(root.Path(), "chart.BMP", path) == S_OK);
  CHECK(path == root / (second + "\\chart.bmp"));
  REQUIRE(SetFileAttributesA(top.c_str(), FILE_ATTRIBUTE_ARCHIVE));
  REQUIRE(FindFileInTree(root.Path(), "chart.bmp", path) == S_OK);
  CHECK(path == top);

  ScratchFolder other;
  MakeFolder(other / ".store");
  MakeFile(other / ".store\\pic.bmp");
  MakeFolder(other / "pic.bmp");
  path = "unchanged";
  CHECK(FindFileInTree(other.Path(), "pic.bmp", path) == E_FAIL);
  CHECK(FindFileInTree(other / "missing", "a.bmp", path) == E_FAIL);
  CHECK(path == "unchanged");
}

TEST_CASE("volume and store files are searched below their registry folders") {
  ScratchFolder volume;
  MakeFolder(volume / "PICS");
  MakeFile(volume / "PICS\\shoal.tif");
  const std::string enumKey = cRegSettings::FullPath(SETTINGS_ENUM_KEY);
  const std::string database = "BrTestDb" + std::to_string(GetCurrentProcessId());
  std::string path;
  {
    SavedRegistryValue folder(HKEY_LOCAL_MACHINE, enumKey + "\\" + database + "\\Volumes\\00", "");
    folder.SetString(volume.Path() + "\\");
    REQUIRE(FindVolumeFile(database, "SHOAL.TIF", path) == S_OK);
    CHECK(path == volume / "PICS\\shoal.tif");
    // The last character goes whatever it is.
    folder.SetString(volume.Path() + "*");
    CHECK(FindVolumeFile(database, "shoal.tif", path) == S_OK);
    CHECK(FindVolumeFile(database, "reef.tif", path) == E_FAIL);
    folder.SetString("");
    CHECK(FindVolumeFile(database, "shoal.tif", path) == REGDB_E_READREGDB);
  }
  RegDeleteTreeA(HKEY_LOCAL_MACHINE, (enumKey + "\\" + database).c_str());
  CHECK(FindVolumeFile(database, "shoal.tif", path) == REGDB_E_READREGDB);

  SavedRegistryValue store(HKEY_LOCAL_MACHINE, enumKey, SETTING_BASES_STORE);
  store.SetString(volume.Path() + "\\");
  REQUIRE(FindStoreFile("shoal.tif", path) == S_OK);
  CHECK(path == volume / "PICS\\shoal.tif");
  store.Delete();
  CHECK(FindStoreFile("shoal.tif", path) == REGDB_E_READREGDB);
}
