// A doctest main with the heap's free checking on (the program's GlobalFlag, read at process
// start: the first run sets it and runs the suite as a child), so a use after free fails.
#define DOCTEST_CONFIG_IMPLEMENT
#include <doctest/doctest.h>

#include <windows.h>

#include "tests/support/crash_report.h"

#include <cstdio>
#include <string>

namespace {

constexpr DWORD kHeapFlags = 0x10 | 0x20 | 0x40;  // tail check, free check, parameter check
constexpr const wchar_t* kChildMark = L"BR_HEAP_CHECKED_CHILD";

bool SetGlobalFlagForThisProgram() {
  wchar_t path[MAX_PATH] = {};
  GetModuleFileNameW(nullptr, path, MAX_PATH);
  const std::wstring name(path);
  const std::wstring key = L"Software\\Microsoft\\Windows NT\\CurrentVersion\\Image File Execution Options\\" +
                           name.substr(name.find_last_of(L"\\/") + 1);
  return RegSetKeyValueW(HKEY_LOCAL_MACHINE, key.c_str(), L"GlobalFlag", REG_DWORD, &kHeapFlags, sizeof kHeapFlags) ==
         ERROR_SUCCESS;
}

// Runs this program again with the same command line; its exit code, or -1. A child that
// fails without a word says nothing of why, so its code is printed here.
int RunChild() {
  SetEnvironmentVariableW(kChildMark, L"1");
  STARTUPINFOW startup = {};
  startup.cb = sizeof startup;
  PROCESS_INFORMATION process = {};
  std::wstring commandLine = GetCommandLineW();
  // The child ends with this process (a test runner that gives up on us kills only us).
  HANDLE job = CreateJobObjectW(nullptr, nullptr);
  JOBOBJECT_EXTENDED_LIMIT_INFORMATION limits = {};
  limits.BasicLimitInformation.LimitFlags = JOB_OBJECT_LIMIT_KILL_ON_JOB_CLOSE;
  SetInformationJobObject(job, JobObjectExtendedLimitInformation, &limits, sizeof limits);
  if (!CreateProcessW(nullptr, &commandLine[0], nullptr, nullptr, TRUE, CREATE_SUSPENDED, nullptr, nullptr, &startup,
                      &process)) {
    std::fprintf(stderr, "heap-checked run: the suite could not be started (error %lu)\n",
                 static_cast<unsigned long>(GetLastError()));
    return -1;
  }
  AssignProcessToJobObject(job, process.hProcess);
  ResumeThread(process.hThread);
  const DWORD waited = WaitForSingleObject(process.hProcess, INFINITE);
  if (waited != WAIT_OBJECT_0)
    std::fprintf(stderr, "heap-checked run: waiting for the suite gave %lu (error %lu)\n",
                 static_cast<unsigned long>(waited), static_cast<unsigned long>(GetLastError()));
  DWORD code = static_cast<DWORD>(-1);
  GetExitCodeProcess(process.hProcess, &code);
  CloseHandle(process.hThread);
  CloseHandle(process.hProcess);
  CloseHandle(job);
  if (code != 0) std::fprintf(stderr, "heap-checked run: the suite ended with code %08lX\n", static_cast<unsigned long>(code));
  return static_cast<int>(code);
}

}  // namespace

int main(int argc, char** argv) {
  br::test::ReportCrashesAndEnd();
  if (!GetEnvironmentVariableW(kChildMark, nullptr, 0) && SetGlobalFlagForThisProgram()) return RunChild();
  doctest::Context context(argc, argv);
  return context.run();
}
