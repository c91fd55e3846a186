#include "host/brtide/tests/brtide_process.h"

#include <windows.h>

#include <stdexcept>

namespace br::test {

namespace {

// An inheritable scratch file for one of the child's streams, gone with its last handle.
HANDLE CaptureFile() {
  wchar_t folder[MAX_PATH + 1] = {}, name[MAX_PATH + 1] = {};
  GetTempPathW(MAX_PATH, folder);
  GetTempFileNameW(folder, L"bt", 0, name);
  SECURITY_ATTRIBUTES inherit = {sizeof inherit, nullptr, TRUE};
  const HANDLE file = CreateFileW(name, GENERIC_READ | GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                                  &inherit, CREATE_ALWAYS, FILE_ATTRIBUTE_TEMPORARY | FILE_FLAG_DELETE_ON_CLOSE, nullptr);
  if (file == INVALID_HANDLE_VALUE) throw std::runtime_error("cannot make a capture file");
  return file;
}

std::string ReadAndClose(HANDLE file) {
  std::string text;
  SetFilePointer(file, 0, nullptr, FILE_BEGIN);
  char buffer[4096];
  for (DWORD got = 0; ReadFile(file, buffer, sizeof buffer, &got, nullptr) && got > 0;) text.append(buffer, got);
  CloseHandle(file);
  return text;
}

}  // namespace

ProcessResult RunBrtide(const std::vector<std::string>& args) {
  // The test programs lie three folders below the build tree (tests/wine/<suite>).
  wchar_t self[MAX_PATH] = {};
  const std::wstring program(self, GetModuleFileNameW(nullptr, self, MAX_PATH));
  const std::wstring exe = program.substr(0, program.find_last_of(L"\\")) + L"\\..\\..\\..\\host\\brtide\\brtide.exe";
  std::wstring line = L"\"" + exe + L"\"";
  for (const std::string& arg : args) {
    std::wstring wide(static_cast<std::size_t>(MultiByteToWideChar(CP_UTF8, 0, arg.c_str(), -1, nullptr, 0)), L'\0');
    MultiByteToWideChar(CP_UTF8, 0, arg.c_str(), -1, wide.data(), static_cast<int>(wide.size()));
    line += L" \"" + wide.substr(0, wide.size() - 1) + L"\"";
  }
  STARTUPINFOW startup = {};
  startup.cb = sizeof startup;
  startup.dwFlags = STARTF_USESTDHANDLES;
  startup.hStdOutput = CaptureFile();
  startup.hStdError = CaptureFile();
  PROCESS_INFORMATION process = {};
  if (!CreateProcessW(exe.c_str(), line.data(), nullptr, nullptr, TRUE, CREATE_NO_WINDOW, nullptr, nullptr, &startup,
                      &process)) {
    throw std::runtime_error("brtide.exe cannot be started");
  }
  WaitForSingleObject(process.hProcess, 120000);
  ProcessResult result;
  GetExitCodeProcess(process.hProcess, &result.exitCode);
  CloseHandle(process.hThread);
  CloseHandle(process.hProcess);
  result.out = ReadAndClose(startup.hStdOutput);
  result.err = ReadAndClose(startup.hStdError);
  return result;
}

}  // namespace br::test
