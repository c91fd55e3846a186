// The error suite runs its doctest cases, or, started with "--child", one
// scenario in a fresh process: the log mask is cached once per process, so the
// registry-driven paths are checked in children.
#define DOCTEST_CONFIG_IMPLEMENT
#include <doctest/doctest.h>

#include <cstring>

#include "tests/support/crash_report.h"

int RunChildScenario(const char* scenario);

int main(int argc, char** argv) {
  br::test::ReportCrashesAndEnd();
  if (argc >= 3 && std::strcmp(argv[1], "--child") == 0) {
    return RunChildScenario(argv[2]);
  }
  doctest::Context context(argc, argv);
  return context.run();
}
