#include "frame/errors/cErrReporter.h"

#include <cstdio>
#include <cstdlib>

#include "frame/format/date_time_format.h"
#include "frame/settings/settings.h"
#include "frame/settings/cRegKeyReader.h"
#include "frame/settings/cRegSettings.h"

namespace br {

namespace {

constexpr std::uint32_t MASK_UNSET = 0xFFFFFFFFu;
constexpr DWORD LOG_FILE_VALUE_MAX_BYTES = 520;  // with the terminator

std::string EnumKeyPath() { return cRegSettings::FullPath(SETTINGS_ENUM_KEY); }

struct PathParts {
  std::string drive;   // "C:"
  std::string folder;  // "\logs\", with its closing separator
  std::string name;    // "error"
  std::string extension;  // ".log"
};

PathParts SplitPath(const std::string& path) {
  char drive[_MAX_DRIVE] = "";
  char folder[_MAX_DIR] = "";
  char name[_MAX_FNAME] = "";
  char extension[_MAX_EXT] = "";
  PathParts parts;
  if (_splitpath_s(path.c_str(), drive, sizeof drive, folder, sizeof folder, name, sizeof name,
                   extension, sizeof extension) == 0) {
    parts = {drive, folder, name, extension};
  }
  return parts;
}

}  // namespace

cErrReporter::cErrReporter() : mask_(CachedLogMask()) {}

std::uint32_t cErrReporter::ReadLogMask(HKEY root, const char* keyPath) {
  cRegKeyReader key(root, keyPath);
  DWORD mask = 0;
  if (!key.IsOpen() || !key.ReadDword(SETTING_LOG_MASK, mask) || mask == MASK_UNSET) {
    return 0;
  }
  return mask;
}

std::uint32_t cErrReporter::CachedLogMask() {
  // Registry changes take effect in the next process only.
  static const std::uint32_t mask = ReadLogMask(HKEY_LOCAL_MACHINE, cRegSettings::BASE_PATH);
  return mask;
}

std::string cErrReporter::LogFilePath() {
  std::string value;
  {
    cRegKeyReader base(HKEY_LOCAL_MACHINE, cRegSettings::BASE_PATH);
    if (!base.IsOpen() || !base.ReadString(SETTING_LOG_FILE, value, LOG_FILE_VALUE_MAX_BYTES) ||
        value.empty()) {
      return std::string();
    }
  }
  const PathParts parts = SplitPath(value);
  if (parts.name.empty() && parts.extension.empty()) {
    return std::string();
  }
  if (!parts.drive.empty() && !parts.folder.empty()) {
    return value.size() <= MAX_PATH ? value : std::string();
  }

  std::string keyPath;
  cRegKeyReader enumKey(HKEY_LOCAL_MACHINE, EnumKeyPath().c_str());
  if (!enumKey.IsOpen() || !enumKey.ReadString(SETTING_KEY_PATH, keyPath, MAX_PATH) ||
      keyPath.empty()) {
    return std::string();
  }
  // KeyPath names a folder, whether or not it closes with a backslash.
  if (keyPath.back() != '\\' && keyPath.back() != '/') {
    keyPath += '\\';
  }
  const PathParts base = SplitPath(keyPath);
  const std::string path = (parts.drive.empty() ? base.drive : parts.drive) +
                           (parts.folder.empty() ? base.folder : parts.folder) + parts.name +
                           parts.extension;
  return path.size() <= MAX_PATH ? path : std::string();
}

bool cErrReporter::SystemMessage(std::int32_t result, std::string& text) {
  char* buffer = nullptr;
  const DWORD length = FormatMessageA(
      FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS,
      nullptr, static_cast<DWORD>(result), LANG_USER_DEFAULT, reinterpret_cast<char*>(&buffer), 0,
      nullptr);
  if (length == 0 || buffer == nullptr) {
    return false;
  }
  text = FirstLineOf(buffer);
  LocalFree(buffer);
  return true;
}

std::uint32_t cErrReporter::CurrentMask() const { return CachedLogMask(); }

int cErrReporter::ShowBox(const std::string& text) const {
  return MessageBoxA(nullptr, text.c_str(), BOX_CAPTION,
                     MB_ABORTRETRYIGNORE | MB_ICONERROR | MB_TASKMODAL | MB_TOPMOST);
}

void cErrReporter::BeginAttempt() noexcept { SetLastError(0); }

void cErrReporter::AppendToLog(const std::string& line) {
  const std::string path = LogFilePath();
  if (path.empty()) {
    return;
  }
  // Opened for this one line: other processes may append between reports.
  FILE* file = std::fopen(path.c_str(), "at");
  if (file == nullptr) {
    return;
  }
  std::fputs(line.c_str(), file);
  std::fclose(file);
}

bool cErrReporter::Report(const char* className, ErrRecord& record) noexcept {
  try {
    return ReportUnguarded(className, record);
  } catch (...) {
    // A report must never take the operation down; out of memory ends it quietly.
    return true;
  }
}

bool cErrReporter::ReportUnguarded(const char* className, ErrRecord& record) {
  DWORD lastError = GetLastError();
  if ((lastError & LIBRARY_ERROR_BIT) == 0) {
    lastError = record.code | LIBRARY_ERROR_BIT;
    SetLastError(lastError);
  }
  mask_ = CurrentMask();

  std::string systemText;
  const bool hasSystemText = SystemMessage(record.result, systemText);
  ErrReportContext context;
  context.className = className;
  context.threadId = GetCurrentThreadId();
  context.systemText = hasSystemText ? systemText.c_str() : nullptr;

  if ((mask_ & LOG_TO_FILE) != 0) {
    SYSTEMTIME now;
    GetLocalTime(&now);
    context.date = FormatDate(now, DATE_PATTERN);
    context.time = FormatTime(now, TIME_PATTERN);
    AppendToLog(FormatErrLogLine(record, context));
  }

  bool goOn = true;
  if ((mask_ & LOG_TO_BOX) != 0) {
    switch (ShowBox(FormatErrBoxText(record, context))) {
      case IDRETRY:
        goOn = false;
        break;
      case IDIGNORE:
        record.result = 0;
        break;
      default:  // IDABORT: go on with the failure
        break;
    }
  }
  // The file and window calls above may have overwritten it.
  SetLastError(lastError);
  return goOn;
}

}  // namespace br
