// File names that come from chart data (pictures, text descriptions) are only compared with
// the names of folder entries, never joined into a path: a name that climbs out of the
// folder, is absolute, is a share, holds a subfolder, a wildcard or a stream finds nothing,
// even where the file it points at exists.
#include <doctest/doctest.h>

#include <string>

#include "frame/settings/data_file_search.h"
#include "frame/settings/settings.h"
#include "frame/settings/cRegSettings.h"
#include "tests/wine/common/registry_test_support.h"

using namespace br;

namespace {

void MakeFile(const std::string& path) {
  WriteTextFile(path, "picture");
  REQUIRE(SetFileAttributesA(path.c_str(), FILE_ATTRIBUTE_ARCHIVE));
}

struct NameRow {
  std::string name;
  const char* found;  // the path found below the store, or null for none
};

}  // namespace

TEST_CASE("names from chart data: only plain names of entries below the folder are found") {
  // <scratch>\outside.png beside the store; store\inner.png and store\sub\deep.png below it.
  ScratchFolder top;
  const std::string store = top / "store";
  REQUIRE(CreateDirectoryA(store.c_str(), nullptr));
  REQUIRE(CreateDirectoryA((store + "\\sub").c_str(), nullptr));
  MakeFile(top / "outside.png");
  MakeFile(store + "\\inner.png");
  MakeFile(store + "\\sub\\deep.png");
  const std::string outside = top / "outside.png";
  const std::string drive = outside.substr(0, 2);             // "C:"
  const std::string share = "\\\\localhost\\" + outside.substr(0, 1) + "$" + outside.substr(2);

  const NameRow rows[] = {
      {"inner.png", "inner.png"},
      {"INNER.PNG", "inner.png"},
      {"deep.png", "sub\\deep.png"},
      {"..\\outside.png", nullptr},
      {"../outside.png", nullptr},
      {"sub\\..\\..\\outside.png", nullptr},
      {"sub\\deep.png", nullptr},
      {"sub/deep.png", nullptr},
      {".\\inner.png", nullptr},
      {outside, nullptr},
      {store + "\\inner.png", nullptr},  // absolute, though inside the store
      {drive + "outside.png", nullptr},
      {share, nullptr},
      {"\\\\?\\" + outside, nullptr},
      {"\\\\.\\" + outside, nullptr},
      {"*.png", nullptr},
      {"inner.pn?", nullptr},
      {"inner.png.", nullptr},
      {"inner.png ", nullptr},
      {"inner.png::$DATA", nullptr},
      {"inner.png\\", nullptr},
      {"..", nullptr},
      {".", nullptr},
      {"sub", nullptr},  // a folder is never a file
      {"", nullptr},
  };

  const std::string enumKey = cRegSettings::FullPath(SETTINGS_ENUM_KEY);
  SavedRegistryValue bases(HKEY_LOCAL_MACHINE, enumKey, SETTING_BASES_STORE);
  bases.SetString(store + "\\");
  int found = 0;
  for (const NameRow& row : rows) {
    INFO(row.name);
    std::string path = "unchanged";
    const HRESULT tree = FindFileInTree(store, row.name.c_str(), path);
    std::string storePath = "unchanged";
    const HRESULT byStore = FindStoreFile(row.name.c_str(), storePath);
    if (row.found) {
      ++found;
      CHECK(tree == S_OK);
      CHECK(path == store + "\\" + row.found);
      CHECK(byStore == S_OK);
      CHECK(storePath == path);
    } else {
      CHECK(tree == E_FAIL);
      CHECK(byStore == E_FAIL);
    }
  }
  CHECK(found == 3);
  std::string path;
  CHECK(FindFileInTree(store, nullptr, path) == E_FAIL);
  CHECK(FindStoreFile(nullptr, path) == E_FAIL);
  // The files the refused names point at are there to be found.
  CHECK(GetFileAttributesA(outside.c_str()) != INVALID_FILE_ATTRIBUTES);
  CHECK(GetFileAttributesA((store + "\\sub\\..\\inner.png").c_str()) != INVALID_FILE_ATTRIBUTES);
}
