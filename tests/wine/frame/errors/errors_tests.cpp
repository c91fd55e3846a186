// The error reporter against the prefix's registry, a real log file and real
// message boxes, their buttons pressed from a hook as they come up.
#include <doctest/doctest.h>

#include <string>
#include <vector>

#include "tests/wine/common/BoxPresser.h"
#include "tests/wine/common/registry_test_support.h"
#include "frame/errors/guarded_operation.h"
#include "frame/errors/cErrReporter.h"
#include "frame/format/date_time_format.h"
#include "frame/settings/settings.h"
#include "frame/settings/cRegSettings.h"

using namespace br;
using br::test::BoxPresser;

namespace {

constexpr const char* OWNER = "CXChartLegend";
const ErrPlace LEGEND_PLACE{"C:\\src\\legend\\XChartLegend.cpp", "SetLegendData", 1240};

// The reporter with a chosen mask instead of the process-wide registry value.
struct MaskedReporter : cErrReporter {
  explicit MaskedReporter(std::uint32_t mask) : mask(mask) {}
  std::uint32_t CurrentMask() const override { return mask; }
  std::uint32_t mask;
};

// The HKLM values the reporter reads, restored after each test.
struct LogSettings {
  SavedRegistryValue file{HKEY_LOCAL_MACHINE, cRegSettings::BASE_PATH, SETTING_LOG_FILE};
  SavedRegistryValue keyPath{HKEY_LOCAL_MACHINE, cRegSettings::FullPath(SETTINGS_ENUM_KEY), SETTING_KEY_PATH};
};

std::string SystemText(std::int32_t result) {
  std::string text;
  return cErrReporter::SystemMessage(result, text) ? text : "(null)";
}

}  // namespace

TEST_CASE("the log mask counts only a DWORD, and 0xFFFFFFFF as 0") {
  const std::string scratch = cRegSettings::FullPath("BrTestMask");
  {
    SavedRegistryValue mask(HKEY_LOCAL_MACHINE, scratch, SETTING_LOG_MASK);
    for (const DWORD value : {5u, 0xFFFFFFFFu, 0xFFFFFFFEu}) {
      mask.SetDword(value);
      CHECK(cErrReporter::ReadLogMask(HKEY_LOCAL_MACHINE, scratch.c_str()) == (value == 0xFFFFFFFFu ? 0 : value));
    }
    mask.SetString("5");
    CHECK(cErrReporter::ReadLogMask(HKEY_LOCAL_MACHINE, scratch.c_str()) == 0);
  }
  RegDeleteTreeA(HKEY_LOCAL_MACHINE, scratch.c_str());
  CHECK(cErrReporter::ReadLogMask(HKEY_LOCAL_MACHINE, scratch.c_str()) == 0);
}

TEST_CASE("the log file path: as it stands with drive and folder, else completed from KeyPath") {
  LogSettings settings;
  const std::string tooLong = "C:\\" + std::string(530, 'a') + ".log";  // beyond the value's 520 bytes
  const std::string noPath = "C:\\" + std::string(300, 'a') + ".log";   // fits the value, not a path
  struct Row { const char* file; DWORD type; const char* keyPath; const char* path; };  // LogFileBRCL, KeyPath: path
  const Row rows[] = {
      {"C:\\logs\\brcl.log", REG_SZ, "D:\\Charts\\", "C:\\logs\\brcl.log"},
      {"error.log", REG_SZ, "D:\\Charts\\", "D:\\Charts\\error.log"},
      {"error.log", REG_SZ, "D:\\Charts", "D:\\Charts\\error.log"},  // closing backslash or not
      {"E:error.log", REG_SZ, "D:\\Charts", "E:\\Charts\\error.log"},
      {"\\logs\\error.log", REG_SZ, "D:\\Charts", "D:\\logs\\error.log"},
      {"\\logs\\error.log", REG_SZ, "", ""},
      {"C:\\logs\\brcl.log", REG_EXPAND_SZ, "D:\\Charts\\", ""},
      {"", REG_SZ, "D:\\Charts\\", ""},
      {tooLong.c_str(), REG_SZ, "D:\\Charts\\", ""},
      {noPath.c_str(), REG_SZ, "D:\\Charts\\", ""},
  };
  for (const Row& row : rows) {
    CAPTURE(&row - rows);
    settings.file.SetString(row.file, row.type);
    settings.keyPath.SetString(row.keyPath);
    CHECK(cErrReporter::LogFilePath() == row.path);
  }
}

TEST_CASE("a failure appends exactly one line with every field and shows nothing") {
  LogSettings settings;
  ScratchFolder folder;
  const std::string log = folder / "brcl.log";
  settings.file.SetString(log);
  WriteTextFile(log, "earlier line\r\n");
  MaskedReporter reporter(cErrReporter::LOG_TO_FILE);
  SYSTEMTIME before, after;
  ErrRecord record;
  GetLocalTime(&before);
  RunGuarded(reporter, OWNER, LEGEND_PLACE, record, [] { throw 1265; });
  const DWORD lastError = GetLastError();
  GetLocalTime(&after);
  const std::string rest = " file:XChartLegend.cpp(1265) CXChartLegend::SetLegendData line:25 code:20000000"
                           " text:'(null)' thread:" + std::to_string(GetCurrentThreadId()) + " hres:0x80004005(" +
                           SystemText(BR_RESULT_FAIL) + ") \r\n";
  const auto expected = [&](const SYSTEMTIME& when) {
    return "earlier line\r\nERR: " + FormatDate(when, DATE_PATTERN) + " " + FormatTime(when, TIME_PATTERN) + rest;
  };
  const std::string text = ReadWholeFile(log);
  CHECK((text == expected(before) || text == expected(after)));
  CHECK((record.failed() && lastError == 0x20000000u));  // bit 29: an application's error
  reporter.BeginAttempt();  // each attempt starts clean
  CHECK(GetLastError() == 0u);
}

TEST_CASE("the box: text and buttons; Retry runs again, Abort keeps the failure, Ignore forgets it") {
  LogSettings settings;
  ScratchFolder folder;
  settings.file.SetString(folder / "brcl.log");
  BoxPresser presser({IDRETRY, IDABORT, IDIGNORE});
  MaskedReporter boxOnly(cErrReporter::LOG_TO_BOX);
  ErrRecord record;
  int attempts = 0;
  RunGuarded(boxOnly, OWNER, LEGEND_PLACE, record, [&] { ++attempts; throw 1265; });
  CHECK((attempts == 2 && record.failed()));
  CHECK(GetFileAttributesA((folder / "brcl.log").c_str()) == INVALID_FILE_ATTRIBUTES);  // no file switch, no file

  // The box still shows when the log file cannot be opened.
  settings.file.SetString("C:\\no such folder\\brcl.log");
  MaskedReporter both(cErrReporter::LOG_TO_FILE | cErrReporter::LOG_TO_BOX);
  RunGuarded(both, OWNER, LEGEND_PLACE, record, [] { throw 3; });
  CHECK_FALSE(record.failed());

  REQUIRE(presser.texts.size() == 3);
  CHECK(presser.texts[0] == "XChartLegend.cpp(1265) CXChartLegend::SetLegendData line:25 code:20000000 hres:0x80004005(" +
                                SystemText(BR_RESULT_FAIL) + ")");
  CHECK(presser.abortRetryIgnore == 3);
}
