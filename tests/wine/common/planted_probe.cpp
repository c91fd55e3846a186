// A DLL that must never be loaded: suites copy it under the names of the DLLs the library
// loads into a folder they make current. Loading it leaves a mark in the current folder
// (planted_probe_ran.txt), so a load that was undone again is still seen.
#include <windows.h>

#include "tests/wine/common/planted_probe.h"

extern "C" __declspec(dllexport) int PlantedProbe() { return 1; }

BOOL WINAPI DllMain(HINSTANCE, DWORD reason, LPVOID) {
  if (reason == DLL_PROCESS_ATTACH) {
    HANDLE mark = CreateFileW(br::test::kPlantedProbeMark, GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS,
                              FILE_ATTRIBUTE_NORMAL, nullptr);
    if (mark != INVALID_HANDLE_VALUE) CloseHandle(mark);
  }
  return TRUE;
}
