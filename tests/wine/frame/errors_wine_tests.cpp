// The error reporter against the prefix's registry, a real log file and real
// message boxes pressed from a second thread.
#include <doctest/doctest.h>

#include <cstring>
#include <string>
#include <vector>

#include "BoxPresser.h"
#include "TestSupport.h"
#include "frame/errors/GuardedOperation.h"
#include "frame/errors/cErrReporter.h"
#include "frame/format/DateTimeFormat.h"
#include "frame/settings/Settings.h"
#include "frame/settings/cRegSettings.h"

namespace {

constexpr const char* OWNER = "CTestOwner";
const ErrPlace LEGEND_PLACE{"C:\\src\\legend\\XChartLegend.cpp", "SetLegendData", 1240};

// The reporter with a chosen mask instead of the process-wide registry value.
class MaskedReporter : public cErrReporter {
public:
  explicit MaskedReporter(std::uint32_t mask) : m_testMask(mask) {}

protected:
  std::uint32_t CurrentMask() const override { return m_testMask; }

private:
  std::uint32_t m_testMask;
};

// The HKLM values the reporter reads, restored after each test.
struct LogSettings {
  SavedRegistryValue mask{HKEY_LOCAL_MACHINE, cRegSettings::BASE_PATH, SETTING_LOG_MASK};
  SavedRegistryValue file{HKEY_LOCAL_MACHINE, cRegSettings::BASE_PATH, SETTING_LOG_FILE};
  SavedRegistryValue keyPath{HKEY_LOCAL_MACHINE, cRegSettings::FullPath(SETTINGS_ENUM_KEY),
                             SETTING_KEY_PATH};
};

std::string Now(const char* pattern, bool date) {
  SYSTEMTIME now;
  GetLocalTime(&now);
  return date ? FormatDate(now, pattern) : FormatTime(now, pattern);
}

std::string SystemText(std::int32_t result) {
  std::string text;
  return cErrReporter::SystemMessage(result, text) ? text : "(null)";
}

// Runs this program again with "--child scenario"; presses any box it shows.
struct ChildRun {
  int exitCode = -1;
  std::vector<SeenBox> boxes;
};

ChildRun RunChild(const char* scenario, std::vector<int> buttons = {},
                  std::function<std::string()> onBox = nullptr) {
  char self[MAX_PATH];
  GetModuleFileNameA(nullptr, self, MAX_PATH);
  std::string command = std::string("\"") + self + "\" --child " + scenario;
  STARTUPINFOA startup{};
  startup.cb = sizeof startup;
  PROCESS_INFORMATION process{};
  ChildRun run;
  REQUIRE(CreateProcessA(nullptr, &command[0], nullptr, nullptr, FALSE, 0, nullptr, nullptr,
                         &startup, &process));
  BoxPresser presser(process.dwProcessId, std::move(buttons), std::move(onBox));
  if (WaitForSingleObject(process.hProcess, 60000) != WAIT_OBJECT_0) {
    TerminateProcess(process.hProcess, 99);
    WaitForSingleObject(process.hProcess, 5000);
  }
  DWORD code = 0;
  GetExitCodeProcess(process.hProcess, &code);
  run.exitCode = static_cast<int>(code);
  CloseHandle(process.hThread);
  CloseHandle(process.hProcess);
  run.boxes = presser.Finish();
  return run;
}

// One failing guarded operation; exit code: attempts x 10 + 1 if it failed.
int FailOnce(cErrReporter& reporter) {
  int attempts = 0;
  ErrRecord record;
  RunGuarded(reporter, OWNER, LEGEND_PLACE, record, [&] {
    ++attempts;
    throw 1265;
  });
  return attempts * 10 + (record.failed() ? 1 : 0);
}

}  // namespace

int RunChildScenario(const char* scenario) {
  if (std::strcmp(scenario, "fail") == 0) {
    cErrReporter reporter;
    return FailOnce(reporter);
  }
  if (std::strcmp(scenario, "cache") == 0) {
    // The mask is read at the first reporter; later changes wait for a new process.
    cErrReporter reporter;
    cRegSettings::Machine().WriteDword(nullptr, SETTING_LOG_MASK, 0);
    return FailOnce(reporter);
  }
  return 100;
}

TEST_CASE("the log mask counts only a DWORD, and 0xFFFFFFFF as 0") {
  const std::string scratch = cRegSettings::FullPath("BrTestMask");
  {
    SavedRegistryValue mask(HKEY_LOCAL_MACHINE, scratch, SETTING_LOG_MASK);
    mask.SetDword(5);
    CHECK(cErrReporter::ReadLogMask(HKEY_LOCAL_MACHINE, scratch.c_str()) == 5);
    mask.SetDword(0xFFFFFFFFu);
    CHECK(cErrReporter::ReadLogMask(HKEY_LOCAL_MACHINE, scratch.c_str()) == 0);
    mask.SetDword(0xFFFFFFFEu);
    CHECK(cErrReporter::ReadLogMask(HKEY_LOCAL_MACHINE, scratch.c_str()) == 0xFFFFFFFEu);
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
  // LogFileBRCL (null: none) and its type, KeyPath (null: none), the path used.
  struct Row { const char* file; DWORD type; const char* keyPath; const char* path; };
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
    row.file ? settings.file.SetString(row.file, row.type) : settings.file.Delete();
    row.keyPath ? settings.keyPath.SetString(row.keyPath) : settings.keyPath.Delete();
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
  const std::string dateBefore = Now(DATE_PATTERN, true);
  const std::string timeBefore = Now(TIME_PATTERN, false);
  ErrRecord record;
  RunGuarded(reporter, "CXChartLegend", LEGEND_PLACE, record, [] { throw 1265; });
  const DWORD lastError = GetLastError();
  const std::string dateAfter = Now(DATE_PATTERN, true);
  const std::string timeAfter = Now(TIME_PATTERN, false);

  const std::vector<std::string> lines = SplitLines(ReadWholeFile(log));
  REQUIRE(lines.size() == 2);
  CHECK(lines[0] == "earlier line\r\n");
  const std::string rest = " file:XChartLegend.cpp(1265) CXChartLegend::SetLegendData line:25"
                           " code:20000000 text:'(null)' thread:" +
                           std::to_string(GetCurrentThreadId()) + " hres:0x80004005(" +
                           SystemText(BR_RESULT_FAIL) + ") \r\n";
  const std::string before = "ERR: " + dateBefore + " " + timeBefore + rest;
  const std::string after = "ERR: " + dateAfter + " " + timeAfter + rest;
  CHECK((lines[1] == before || lines[1] == after));
  CHECK(record.failed());
  CHECK(lastError == 0x20000000u);
}

TEST_CASE("without the file switch, or without a usable file, nothing is written and nothing fails") {
  LogSettings settings;
  ScratchFolder folder;
  settings.file.SetString(folder / "brcl.log");
  ErrRecord record;
  MaskedReporter silent(0);
  RunGuarded(silent, OWNER, LEGEND_PLACE, record, [] { throw 1; });
  CHECK_FALSE(FileExists(folder / "brcl.log"));
  CHECK(record.failed());

  settings.file.SetString(folder / "missing\\brcl.log");
  MaskedReporter logging(cErrReporter::LOG_TO_FILE | 2 | 8);  // other bits do nothing
  RunGuarded(logging, OWNER, LEGEND_PLACE, record, [] { throw 1; });
  CHECK(record.failed());
  CHECK(GetLastError() == 0x20000000u);
}

TEST_CASE("the thread's last error carries bit 29 and the record's code") {
  MaskedReporter reporter(0);
  ErrRecord record(LEGEND_PLACE);
  record.code = 0x15;
  SetLastError(ERROR_ACCESS_DENIED);
  CHECK(reporter.ReportResult(OWNER, record, BR_RESULT_FAIL));
  CHECK(GetLastError() == 0x20000015u);

  SetLastError(0x20000099u);  // an earlier library error stays
  reporter.Report(OWNER, record);
  CHECK(GetLastError() == 0x20000099u);

  reporter.BeginAttempt();
  CHECK(GetLastError() == 0u);
}

TEST_CASE("the box: caption, buttons, text; Abort keeps the failure") {
  LogSettings settings;
  ScratchFolder folder;
  settings.file.SetString(folder / "brcl.log");
  MaskedReporter reporter(cErrReporter::LOG_TO_BOX);
  BoxPresser presser(GetCurrentProcessId(), {IDABORT});
  ErrRecord record;
  RunGuarded(reporter, "CXChartLegend", LEGEND_PLACE, record, [] { throw 1265; });
  const std::vector<SeenBox> boxes = presser.Finish();
  REQUIRE(boxes.size() == 1);
  CHECK(boxes[0].text == "XChartLegend.cpp(1265) CXChartLegend::SetLegendData line:25 "
                         "code:20000000 hres:0x80004005(" +
                             SystemText(BR_RESULT_FAIL) + ")");
  CHECK(boxes[0].hasAbortRetryIgnore);
  CHECK(boxes[0].errorIcon);
  CHECK(record.failed());
  CHECK_FALSE(FileExists(folder / "brcl.log"));
}

TEST_CASE("the box still shows when the log file cannot be opened") {
  LogSettings settings;
  settings.file.SetString("C:\\no such folder\\brcl.log");
  MaskedReporter reporter(cErrReporter::LOG_TO_FILE | cErrReporter::LOG_TO_BOX);
  BoxPresser presser(GetCurrentProcessId(), {IDIGNORE});
  ErrRecord record;
  RunGuarded(reporter, OWNER, LEGEND_PLACE, record, [] { throw 3; });
  CHECK(presser.Finish().size() == 1);
  CHECK_FALSE(record.failed());
}

TEST_CASE("a fresh process takes its switches from LogBRCL") {
  LogSettings settings;
  ScratchFolder folder;
  const std::string log = folder / "brcl.log";
  settings.file.SetString(log);

  // What mask 1 alone does is the in-process "one line ... shows nothing" case.
  SUBCASE("5: the line, then the box; Retry and Abort") {
    settings.mask.SetDword(5);
    const ChildRun run = RunChild("fail", {IDRETRY, IDABORT}, [&] {
      return std::to_string(SplitLines(ReadWholeFile(log)).size());
    });
    CHECK(run.exitCode == 21);
    REQUIRE(run.boxes.size() == 2);
    CHECK(run.boxes[0].note == "1");
    CHECK(run.boxes[1].note == "2");
    CHECK(run.boxes[0].text.rfind("XChartLegend.cpp(1265) CTestOwner::SetLegendData line:25", 0) ==
          0);
  }
  SUBCASE("the mask is read once per process") {
    settings.mask.SetDword(1);
    CHECK(RunChild("cache").exitCode == 11);
    CHECK(cRegSettings::Machine().ReadDword(nullptr, SETTING_LOG_MASK, 7) == 0);
    CHECK(SplitLines(ReadWholeFile(log)).size() == 1);
  }
}
