// DLLs that ship with Windows are loaded from the system folder only: a copy planted in the
// current folder under the same name is never loaded, nor one under a name the system
// folder lacks, and names with a path in them load nothing.
#include <doctest/doctest.h>

#include <windows.h>

#include <string>

#include "tests/wine/common/PlantedFolder.h"
#include "tests/wine/common/planted_probe.h"
#include "toolkit/core/system_library.h"

using br::test::PlantedFolder;

namespace {

const wchar_t* const kSystemNames[] = {L"oleacc.dll",   L"atl.dll",     L"atl100.dll",  L"usp10.dll",
                                       L"riched20.dll", L"riched32.dll", L"msftedit.dll", L"gdiplus.dll"};

bool InFolder(const std::wstring& path, const std::wstring& folder) {
  return path.size() > folder.size() &&
         CompareStringOrdinal(path.c_str(), static_cast<int>(folder.size()), folder.c_str(),
                              static_cast<int>(folder.size()), TRUE) == CSTR_EQUAL;
}

}  // namespace

TEST_CASE("a copy planted in the current folder: a bare-name load takes it, the system folder load does not") {
  PlantedFolder planted;
  planted.Plant(L"br_planted_only.dll");
  // The plant works: a plain load by name searches the current folder and runs it.
  HMODULE plain = LoadLibraryW(L"br_planted_only.dll");
  REQUIRE(plain != nullptr);
  CHECK(reinterpret_cast<void*>(GetProcAddress(plain, br::test::kPlantedProbeExport)) != nullptr);
  CHECK(planted.ProbeRan());
  FreeLibrary(plain);
  planted.ForgetProbeRan();

  CHECK(toolkit::LoadSystemLibrary(L"br_planted_only.dll") == nullptr);
  CHECK_FALSE(planted.ProbeRan());
  CHECK(planted.ModulesFromHere().empty());
}

TEST_CASE("system DLLs come from the system folder although planted copies lie in the current folder") {
  PlantedFolder planted;
  for (const wchar_t* name : kSystemNames) planted.Plant(name);
  const std::wstring system = PlantedFolder::SystemFolder();
  int loaded = 0;
  for (const wchar_t* name : kSystemNames) {
    INFO(std::string(name, name + wcslen(name)));
    HMODULE module = toolkit::LoadSystemLibrary(name);
    if (module == nullptr) continue;  // not installed here: then nothing at all is loaded
    ++loaded;
    CHECK(InFolder(PlantedFolder::ModulePath(module), system));
    CHECK(reinterpret_cast<void*>(GetProcAddress(module, br::test::kPlantedProbeExport)) == nullptr);
    FreeLibrary(module);
  }
  // oleacc, atl, usp10, riched20 and gdiplus are part of every Windows (and Wine prefix).
  CHECK(loaded >= 5);
  CHECK_FALSE(planted.ProbeRan());
  CHECK(planted.ModulesFromHere().empty());
}

TEST_CASE("names with a path in them load nothing") {
  PlantedFolder planted;
  planted.Plant(L"oleacc.dll");
  const std::wstring system = PlantedFolder::SystemFolder();
  const std::wstring systemOleacc = system + L"oleacc.dll";
  const std::wstring plantedOleacc = planted.Path() + L"\\oleacc.dll";
  const std::wstring names[] = {L".\\oleacc.dll", L"..\\" + planted.Path().substr(planted.Path().rfind(L'\\') + 1) + L"\\oleacc.dll",
                                plantedOleacc, systemOleacc, L"\\\\localhost\\C$\\windows\\system32\\oleacc.dll",
                                L"sub/oleacc.dll", L"C:oleacc.dll", L""};
  for (const std::wstring& name : names) {
    INFO(std::string(name.begin(), name.end()));
    CHECK(toolkit::LoadSystemLibrary(name.c_str()) == nullptr);
  }
  CHECK(toolkit::LoadSystemLibrary(nullptr) == nullptr);
  CHECK_FALSE(planted.ProbeRan());
}
