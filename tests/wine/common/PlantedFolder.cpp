#include "tests/wine/common/PlantedFolder.h"

#include <tlhelp32.h>

#include <doctest/doctest.h>

#include "tests/wine/common/planted_probe.h"

namespace br::test {

namespace {

// The probe as built: the nearest folder above the test program that holds it.
std::wstring ProbePath() {
  std::wstring folder = PlantedFolder::ModulePath(nullptr);
  for (;;) {
    const std::size_t cut = folder.find_last_of(L"\\/");
    if (cut == std::wstring::npos) return std::wstring();
    folder.resize(cut);
    const std::wstring candidate = folder + L"\\planted_probe.dll";
    if (GetFileAttributesW(candidate.c_str()) != INVALID_FILE_ATTRIBUTES) return candidate;
  }
}

bool StartsWithFolder(const std::wstring& path, const std::wstring& folder) {
  return path.size() > folder.size() &&
         CompareStringOrdinal(path.c_str(), static_cast<int>(folder.size()), folder.c_str(),
                              static_cast<int>(folder.size()), TRUE) == CSTR_EQUAL;
}

}  // namespace

PlantedFolder::PlantedFolder() {
  REQUIRE(!ProbePath().empty());
  wchar_t temp[MAX_PATH];
  GetTempPathW(MAX_PATH, temp);
  static unsigned counter = 0;
  do {
    path_ = std::wstring(temp) + L"brplanted_" + std::to_wstring(GetCurrentProcessId()) + L"_" +
            std::to_wstring(++counter);
  } while (!CreateDirectoryW(path_.c_str(), nullptr));
  wchar_t previous[MAX_PATH];
  GetCurrentDirectoryW(MAX_PATH, previous);
  previous_ = previous;
  REQUIRE(SetCurrentDirectoryW(path_.c_str()));
}

PlantedFolder::~PlantedFolder() {
  SetCurrentDirectoryW(previous_.c_str());
  WIN32_FIND_DATAW entry;
  HANDLE find = FindFirstFileW((path_ + L"\\*").c_str(), &entry);
  if (find != INVALID_HANDLE_VALUE) {
    do {
      DeleteFileW((path_ + L"\\" + entry.cFileName).c_str());
    } while (FindNextFileW(find, &entry));
    FindClose(find);
  }
  RemoveDirectoryW(path_.c_str());
}

void PlantedFolder::Plant(const wchar_t* fileName) const {
  REQUIRE(CopyFileW(ProbePath().c_str(), (path_ + L"\\" + fileName).c_str(), FALSE));
}

bool PlantedFolder::ProbeRan() const {
  return GetFileAttributesW((path_ + L"\\" + kPlantedProbeMark).c_str()) != INVALID_FILE_ATTRIBUTES;
}

void PlantedFolder::ForgetProbeRan() const { DeleteFileW((path_ + L"\\" + kPlantedProbeMark).c_str()); }

std::vector<std::wstring> PlantedFolder::ModulesFromHere() const {
  std::vector<std::wstring> found;
  HANDLE snapshot = CreateToolhelp32Snapshot(TH32CS_SNAPMODULE, GetCurrentProcessId());
  REQUIRE(snapshot != INVALID_HANDLE_VALUE);
  MODULEENTRY32W module{};
  module.dwSize = sizeof module;
  int listed = 0;
  for (BOOL more = Module32FirstW(snapshot, &module); more; more = Module32NextW(snapshot, &module)) {
    ++listed;
    if (StartsWithFolder(module.szExePath, path_ + L"\\")) found.push_back(module.szExePath);
  }
  CloseHandle(snapshot);
  CHECK(listed > 3);  // the snapshot did list the process's modules
  return found;
}

std::wstring PlantedFolder::SystemFolder() {
  wchar_t folder[MAX_PATH];
  const UINT length = GetSystemDirectoryW(folder, MAX_PATH);
  std::wstring text(folder, length);
  if (text.empty() || text.back() != L'\\') text += L'\\';
  return text;
}

std::wstring PlantedFolder::ModulePath(HMODULE module) {
  std::vector<wchar_t> buffer(32768);
  const DWORD n = GetModuleFileNameW(module, buffer.data(), static_cast<DWORD>(buffer.size()));
  return std::wstring(buffer.data(), n);
}

}  // namespace br::test
