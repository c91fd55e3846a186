// Where the script processor comes from: the system folder only, never a DLL of the
// same name beside the host or in the current directory; and a process that has none.
#include <doctest/doctest.h>

#include <windows.h>

#include <algorithm>
#include <cstdlib>
#include <cwchar>
#include <string>
#include <vector>

#include "tests/wine/toolkit/text/planted_script_library.h"
#include "tests/wine/toolkit/text/text_test_support.h"
#include "toolkit/text/TextEngine.h"

using namespace br::test;
using toolkit::TextEngine;

namespace {

const bool kInChild = std::getenv("BR_TEXT_WITHOUT_USP10") != nullptr;

std::wstring ModulePath(HMODULE module) {
  wchar_t path[MAX_PATH] = {};
  GetModuleFileNameW(module, path, MAX_PATH);
  return path;
}

std::wstring Folder(const std::wstring& path) { return path.substr(0, path.find_last_of(L"\\/")); }

std::wstring SystemFolder() {
  wchar_t folder[MAX_PATH] = {};
  GetSystemDirectoryW(folder, MAX_PATH);
  return folder;
}

bool SameFolder(const std::wstring& a, const std::wstring& b) { return lstrcmpiW(a.c_str(), b.c_str()) == 0; }

// A scratch folder made current for the life of the object.
class CurrentFolder {
public:
  CurrentFolder() {
    wchar_t temp[MAX_PATH];
    GetTempPathW(MAX_PATH, temp);
    folder_ = std::wstring(temp) + L"br_text_plant_" + std::to_wstring(GetCurrentProcessId());
    CreateDirectoryW(folder_.c_str(), nullptr);
    wchar_t previous[MAX_PATH];
    GetCurrentDirectoryW(MAX_PATH, previous);
    previous_ = previous;
    SetCurrentDirectoryW(folder_.c_str());
  }
  ~CurrentFolder() {
    SetCurrentDirectoryW(previous_.c_str());
    for (const std::wstring& file : files_) DeleteFileW(file.c_str());
    RemoveDirectoryW(folder_.c_str());
  }
  bool Plant(const std::wstring& from, const wchar_t* name) {
    files_.push_back(folder_ + L"\\" + name);
    return CopyFileW(from.c_str(), files_.back().c_str(), FALSE) != 0;
  }

private:
  std::wstring folder_, previous_;
  std::vector<std::wstring> files_;
};

}  // namespace

TEST_CASE("the script processor is loaded from the system folder with its twelve entry points" *
          doctest::skip(kInChild)) {
  TextEngine engine;
  REQUIRE(engine.available());
  CHECK(SameFolder(Folder(ModulePath(engine.scriptModule())), SystemFolder()));

  SUBCASE("names that are empty, carry a folder, or lack the entry points are refused") {
    CHECK_FALSE(engine.loadScriptLibrary(nullptr));
    CHECK_FALSE(engine.available());
    CHECK_FALSE(engine.loadScriptLibrary(L""));
    CHECK_FALSE(engine.loadScriptLibrary(L"..\\usp10.dll"));
    CHECK_FALSE(engine.loadScriptLibrary(L"C:usp10.dll"));
    CHECK_FALSE(engine.loadScriptLibrary((SystemFolder() + L"\\usp10.dll").c_str()));
    CHECK_FALSE(engine.loadScriptLibrary(L"kernel32.dll"));  // found, but without the entry points
    CHECK(engine.scriptModule() != nullptr);
    CHECK(engine.loadScriptLibrary(L"usp10.dll"));
  }
  SUBCASE("a slot's script cache survives reloading") {
    EngineOnCanvas e(kArabicFace, true);
    CHECK(e.Draw(L"Ouessant", 300) == 1);
    CHECK(e.engine.loadScriptLibrary(L"usp10.dll"));
    CHECK(e.Draw(L"Ouessant", 300) == 1);
    CHECK(e.engine.lastLayout().front().shaped);
  }
}

TEST_CASE("a planted library beside the host or in the current directory is never loaded" * doctest::skip(kInChild)) {
  const std::wstring host = Folder(ModulePath(nullptr));
  const std::wstring plant = host + L"\\" + kPlantedLibrary;
  REQUIRE(GetFileAttributesW(plant.c_str()) != INVALID_FILE_ATTRIBUTES);
  CurrentFolder current;
  REQUIRE(current.Plant(plant, L"usp10.dll"));
  REQUIRE(current.Plant(plant, L"br_cwd_usp10.dll"));

  TextEngine engine(false);
  // Beside the host and in the current directory only: not found.
  CHECK_FALSE(engine.loadScriptLibrary(kPlantedLibrary));
  CHECK_FALSE(engine.loadScriptLibrary(L"br_cwd_usp10.dll"));
  CHECK(GetModuleHandleW(kPlantedLibrary) == nullptr);
  CHECK(GetModuleHandleW(L"br_cwd_usp10.dll") == nullptr);
  // The real name: the system's library, not the plant in the current directory.
  REQUIRE(engine.loadScriptLibrary(L"usp10.dll"));
  const bool systemIsPlant = GetProcAddress(engine.scriptModule(), kPlantedMarker) != nullptr;
  CHECK_FALSE(systemIsPlant);
  CHECK(SameFolder(Folder(ModulePath(engine.scriptModule())), SystemFolder()));

  // The plants are where a plain search would take them from.
  HMODULE naive = LoadLibraryW(L"br_cwd_usp10.dll");
  CHECK(naive != nullptr);
  if (naive) {
    const bool naiveIsPlant = GetProcAddress(naive, kPlantedMarker) != nullptr;
    CHECK(naiveIsPlant);
    FreeLibrary(naive);
  }
}

// The cases below run only in the suite's second process, where usp10 is disabled
// (wine.toolkit_text_without_usp10 sets WINEDLLOVERRIDES=usp10=d and the variable).
TEST_CASE("without usp10: it cannot be loaded, and the engine says so" * doctest::skip(!kInChild)) {
  CHECK(LoadLibraryW(L"usp10.dll") == nullptr);
  TextEngine engine;
  CHECK_FALSE(engine.available());
  CHECK(engine.scriptModule() == nullptr);
}

TEST_CASE("without usp10: measuring and paragraphs go through GDI, nothing lost" * doctest::skip(!kInChild)) {
  EngineOnCanvas e(kArabicFace, true);
  REQUIRE_FALSE(e.engine.available());
  const std::wstring latin = L"Pointe du Raz, raz de Sein";
  SIZE gdi{};
  GetTextExtentPoint32W(e.canvas.Dc(), latin.c_str(), static_cast<int>(latin.size()), &gdi);
  CHECK(e.engine.measureText(e.canvas.Dc(), latin).cx == gdi.cx);

  std::wstring text;
  while (text.size() < 1500) text += L"Raz de Sein \u0645\u064A\u0646\u0627\u0621 \u4e0a\u6d77\u6e2f ";
  text.resize(1500);
  const int lines = e.Draw(text, 200);
  CHECK(lines > 10);
  CheckCovers(e.engine.lastLayout(), 0, 1500);
  for (const auto& run : e.engine.lastLayout()) {
    CHECK_FALSE(run.shaped);
    CHECK(run.width <= 200);
  }
  CHECK(InkIn(e.canvas, 10, 10, 210, 10 + 20 * std::min(lines, 29)) > 100);
}
