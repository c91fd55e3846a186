#include "tests/wine/host/brtide_process.h"

#include <windows.h>

#include <sstream>
#include <stdexcept>

namespace br::test {

namespace {

std::wstring Wide(const std::string& text) {
  if (text.empty()) return std::wstring();
  const int n = MultiByteToWideChar(CP_UTF8, 0, text.data(), static_cast<int>(text.size()), nullptr, 0);
  std::wstring wide(static_cast<std::size_t>(n), L'\0');
  MultiByteToWideChar(CP_UTF8, 0, text.data(), static_cast<int>(text.size()), wide.data(), n);
  return wide;
}

// An inheritable scratch file the child writes one of its streams to.
class CaptureFile {
public:
  explicit CaptureFile(const wchar_t* prefix) {
    wchar_t folder[MAX_PATH + 1] = {};
    wchar_t name[MAX_PATH + 1] = {};
    GetTempPathW(MAX_PATH, folder);
    GetTempFileNameW(folder, prefix, 0, name);
    SECURITY_ATTRIBUTES inherit = {sizeof inherit, nullptr, TRUE};
    // Gone with the last handle, even when the child's copy outlives ours for a moment.
    handle_ = CreateFileW(name, GENERIC_READ | GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                          &inherit, CREATE_ALWAYS, FILE_ATTRIBUTE_TEMPORARY | FILE_FLAG_DELETE_ON_CLOSE, nullptr);
    if (handle_ == INVALID_HANDLE_VALUE) throw std::runtime_error("cannot make a capture file");
  }
  ~CaptureFile() { CloseHandle(handle_); }
  CaptureFile(const CaptureFile&) = delete;
  CaptureFile& operator=(const CaptureFile&) = delete;

  HANDLE Handle() const { return handle_; }
  std::string Contents() const {
    std::string text;
    SetFilePointer(handle_, 0, nullptr, FILE_BEGIN);
    char buffer[4096];
    DWORD got = 0;
    while (ReadFile(handle_, buffer, sizeof buffer, &got, nullptr) && got > 0) text.append(buffer, got);
    return text;
  }

private:
  HANDLE handle_ = INVALID_HANDLE_VALUE;
};

std::wstring BuiltBrtidePath() {
  std::vector<wchar_t> buffer(32768);
  const DWORD n = GetModuleFileNameW(nullptr, buffer.data(), static_cast<DWORD>(buffer.size()));
  std::wstring folder(buffer.data(), n);
  for (std::size_t cut; (cut = folder.find_last_of(L"\\/")) != std::wstring::npos;) {
    folder.resize(cut);
    const std::wstring candidate = folder + L"\\host\\brtide\\brtide.exe";
    if (GetFileAttributesW(candidate.c_str()) != INVALID_FILE_ATTRIBUTES) return candidate;
  }
  throw std::runtime_error("brtide.exe not found above the test program");
}

}  // namespace

ProcessResult RunBrtide(const std::vector<std::string>& args) {
  const std::wstring exe = BuiltBrtidePath();
  std::wstring line = L"\"" + exe + L"\"";
  for (const std::string& arg : args) line += L" \"" + Wide(arg) + L"\"";

  CaptureFile out(L"bto");
  CaptureFile err(L"bte");
  STARTUPINFOW startup = {};
  startup.cb = sizeof startup;
  startup.dwFlags = STARTF_USESTDHANDLES;
  startup.hStdInput = nullptr;
  startup.hStdOutput = out.Handle();
  startup.hStdError = err.Handle();
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
  result.out = out.Contents();
  result.err = err.Contents();
  return result;
}

std::vector<std::string> TextLines(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream in(text);
  for (std::string line; std::getline(in, line);) lines.push_back(line);
  return lines;
}

}  // namespace br::test
