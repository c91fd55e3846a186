// The geodesy library is found only where it may be (full paths of known folders), used
// through its four exports, and absent without harm; BR_Info.dll does not import it.
#include <doctest/doctest.h>

#include <windows.h>

#include <cstring>
#include <string>
#include <vector>

#include "frame/geo/GeodesyLibrary.h"
#include "host/brgbase/map_metrics.h"
#include "tests/wine/common/registry_test_support.h"

using br::geo::GeodesyLibrary;

namespace {

std::wstring ProgramFolder() {
  wchar_t path[MAX_PATH];
  GetModuleFileNameW(nullptr, path, MAX_PATH);
  std::wstring folder = path;
  return folder.substr(0, folder.find_last_of(L'\\'));
}

// The build tree's top folder: the nearest folder above the program that holds the file.
std::wstring FolderAboveHolding(const wchar_t* file) {
  std::wstring folder = ProgramFolder();
  while (!folder.empty()) {
    if (GetFileAttributesW((folder + L"\\" + file).c_str()) != INVALID_FILE_ATTRIBUTES) return folder;
    const std::size_t slash = folder.find_last_of(L'\\');
    if (slash == std::wstring::npos) break;
    folder.resize(slash);
  }
  return std::wstring();
}

bool GeodesyModuleLoaded() { return GetModuleHandleW(GeodesyLibrary::FILE_NAME) != nullptr; }

// Module names in the import table of a DLL mapped as an image without its imports resolved.
std::vector<std::string> ImportedModules(const std::wstring& path) {
  std::vector<std::string> names;
  HMODULE image = LoadLibraryExW(path.c_str(), nullptr, DONT_RESOLVE_DLL_REFERENCES);
  REQUIRE(image != nullptr);
  const auto* base = reinterpret_cast<const BYTE*>(image);
  const auto* dos = reinterpret_cast<const IMAGE_DOS_HEADER*>(base);
  const auto* nt = reinterpret_cast<const IMAGE_NT_HEADERS*>(base + dos->e_lfanew);
  const IMAGE_DATA_DIRECTORY& imports = nt->OptionalHeader.DataDirectory[IMAGE_DIRECTORY_ENTRY_IMPORT];
  for (auto* entry = reinterpret_cast<const IMAGE_IMPORT_DESCRIPTOR*>(base + imports.VirtualAddress);
       imports.VirtualAddress != 0 && entry->Name != 0; ++entry) {
    names.push_back(reinterpret_cast<const char*>(base + entry->Name));
  }
  FreeLibrary(image);
  return names;
}

}  // namespace

TEST_CASE("the stand-in geodesy library: datum names from the S-57 list, 1e-7 degree, a map-metrics block") {
  const std::wstring buildFolder = FolderAboveHolding(GeodesyLibrary::FILE_NAME);
  REQUIRE(!buildFolder.empty());
  {
    GeodesyLibrary geodesy({buildFolder});
    REQUIRE(geodesy.Loaded());
    CHECK(geodesy.Path() == buildFolder + L"\\BRGBASE.dll");
    CHECK(geodesy.DatumName(2) == "WGS 84");
    CHECK(geodesy.DatumName(13) == "Astro beacon \"E\" 1945");  // backslash-escaped in the CSV
    CHECK(geodesy.DatumName(0).empty());
    CHECK(geodesy.DatumName(100000).empty());
    CHECK(*geodesy.Degrees(123456789) == doctest::Approx(12.3456789));
    CHECK(*geodesy.Degrees(-900000000) == doctest::Approx(-90.0));

    GEO_MAP_METRICS* seen = nullptr;
    bool initialisedDuring = false;
    CHECK(geodesy.WithMapMetrics([&](GEO_MAP_METRICS* metrics) {
      seen = metrics;
      initialisedDuring = br::brgbase::IsInitialisedMetrics(metrics);
    }));
    CHECK(seen != nullptr);
    CHECK(initialisedDuring);
  }
  CHECK_FALSE(GeodesyModuleLoaded());  // unloaded with its holder
}

TEST_CASE("absent, planted in the current folder or named relatively: nothing loads, nothing runs") {
  const std::wstring buildFolder = FolderAboveHolding(GeodesyLibrary::FILE_NAME);
  REQUIRE(!buildFolder.empty());
  ScratchFolder planted;
  const std::wstring plantedFolder(planted.Path().begin(), planted.Path().end());
  REQUIRE(CopyFileW((buildFolder + L"\\BRGBASE.dll").c_str(), (plantedFolder + L"\\BRGBASE.dll").c_str(), FALSE));

  wchar_t previous[MAX_PATH];
  GetCurrentDirectoryW(MAX_PATH, previous);
  REQUIRE(SetCurrentDirectoryW(plantedFolder.c_str()));
  {
    // The known folders: the test program's (which holds no copy), twice here.
    GeodesyLibrary known(GeodesyLibrary::KnownFolders());
    CHECK_FALSE(known.Loaded());
    GeodesyLibrary relative({L".", L"BRGBASE-folder", L""});
    CHECK_FALSE(relative.Loaded());
    CHECK_FALSE(GeodesyModuleLoaded());

    CHECK(known.DatumName(2).empty());
    CHECK_FALSE(known.Degrees(10).has_value());
    bool ran = false;
    CHECK_FALSE(known.WithMapMetrics([&](GEO_MAP_METRICS*) { ran = true; }));
    CHECK_FALSE(ran);
  }
  SetCurrentDirectoryW(previous);
  CHECK(GeodesyLibrary::KnownFolders().back() == ProgramFolder());
}

TEST_CASE("BR_Info.dll does not import the geodesy library") {
  const std::wstring folder = FolderAboveHolding(L"BR_Info.dll");
  REQUIRE(!folder.empty());
  const std::vector<std::string> modules = ImportedModules(folder + L"\\BR_Info.dll");
  bool kernel = false;
  for (const std::string& name : modules) {
    INFO(name);
    CHECK(lstrcmpiA(name.c_str(), "BRGBASE.dll") != 0);
    kernel = kernel || lstrcmpiA(name.c_str(), "KERNEL32.dll") == 0;
  }
  CHECK(kernel);  // the table was read
}
