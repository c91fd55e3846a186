// A doctest main with the heap's free checking on (the program's GlobalFlag, read at process
// start: the first run sets it and runs the suite as a child), so a use after free fails.
#define DOCTEST_CONFIG_IMPLEMENT
#include <doctest/doctest.h>

#include <windows.h>

#include "tests/wine/common/crash_report.h"

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

// Runs this program again with the same command line, in a job that ends it with this
// process; its exit code, printed when not 0 (a child that fails silently says nothing).
int RunChild() {
  SetEnvironmentVariableW(kChildMark, L"1");
  STARTUPINFOW startup = {};
  startup.cb = sizeof startup;
  PROCESS_INFORMATION process = {};
  std::wstring commandLine = GetCommandLineW();
  HANDLE job = CreateJobObjectW(nullptr, nullptr);
  JOBOBJECT_EXTENDED_LIMIT_INFORMATION limits = {};
  limits.BasicLimitInformation.LimitFlags = JOB_OBJECT_LIMIT_KILL_ON_JOB_CLOSE;
  SetInformationJobObject(job, JobObjectExtendedLimitInformation, &limits, sizeof limits);
  if (!CreateProcessW(nullptr, &commandLine[0], nullptr, nullptr, TRUE, CREATE_SUSPENDED, nullptr, nullptr, &startup,
                      &process))
    return std::fprintf(stderr, "heap-checked run: no child (error %lu)\n", GetLastError()), -1;
  AssignProcessToJobObject(job, process.hProcess);
  ResumeThread(process.hThread);
  const DWORD waited = WaitForSingleObject(process.hProcess, INFINITE);
  DWORD code = static_cast<DWORD>(-1);
  GetExitCodeProcess(process.hProcess, &code);
  if (code != 0) std::fprintf(stderr, "heap-checked run: wait %lu, child exit code %08lX\n", waited, code);
  for (HANDLE h : {process.hThread, process.hProcess, job}) CloseHandle(h);
  return static_cast<int>(code);
}

}  // namespace

int main(int argc, char** argv) {
  br::test::ReportCrashesAndEnd();
  if (!GetEnvironmentVariableW(kChildMark, nullptr, 0) && SetGlobalFlagForThisProgram()) return RunChild();
  doctest::Context context(argc, argv);
  return context.run();
}
