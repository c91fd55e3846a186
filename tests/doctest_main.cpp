#define DOCTEST_CONFIG_IMPLEMENT
#include <doctest/doctest.h>

#ifdef _WIN32
#include "tests/wine/common/crash_report.h"
#endif

int main(int argc, char** argv) {
#ifdef _WIN32
  br::test::ReportCrashesAndEnd();
#endif
  doctest::Context context(argc, argv);
  return context.run();
}
