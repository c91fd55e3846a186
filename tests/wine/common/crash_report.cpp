#include "tests/wine/common/crash_report.h"

#include <doctest/doctest.h>
#include <windows.h>

#include <atomic>
#include <cstdio>
#include <cstring>

namespace br::test {

namespace {

// The running test case's name, kept in a fixed buffer: the crash filter must not allocate.
char g_testCase[256] = "(before the first test case)";

struct TestCaseName : doctest::IReporter {
  explicit TestCaseName(const doctest::ContextOptions&) {}
  void test_case_start(const doctest::TestCaseData& data) override {
    std::snprintf(g_testCase, sizeof g_testCase, "%s", data.m_name);
  }
  void report_query(const doctest::QueryData&) override {}
  void test_run_start() override {}
  void test_run_end(const doctest::TestRunStats&) override {}
  void test_case_reenter(const doctest::TestCaseData&) override {}
  void test_case_end(const doctest::CurrentTestCaseStats&) override {}
  void test_case_exception(const doctest::TestCaseException&) override {}
  void subcase_start(const doctest::SubcaseSignature&) override {}
  void subcase_end() override {}
  void log_assert(const doctest::AssertData&) override {}
  void log_message(const doctest::MessageData&) override {}
  void test_case_skipped(const doctest::TestCaseData&) override {}
};
DOCTEST_REGISTER_LISTENER("br-test-case-name", 1, TestCaseName);

void PrintFrame(const char* label, DWORD64 address) {
  HMODULE module = nullptr;
  char name[MAX_PATH] = "?";
  if (GetModuleHandleExA(GET_MODULE_HANDLE_EX_FLAG_FROM_ADDRESS | GET_MODULE_HANDLE_EX_FLAG_UNCHANGED_REFCOUNT,
                         reinterpret_cast<LPCSTR>(address), &module) &&
      GetModuleFileNameA(module, name, MAX_PATH)) {
    const char* base = std::strrchr(name, '\\');
    std::fprintf(stderr, "  %s %s+0x%llx\n", label, base ? base + 1 : name,
                 static_cast<unsigned long long>(address - reinterpret_cast<DWORD64>(module)));
  } else {
    std::fprintf(stderr, "  %s 0x%llx\n", label, static_cast<unsigned long long>(address));
  }
}

void PrintStack(const CONTEXT& at) {
#ifdef _WIN64
  CONTEXT context = at;
  for (int frame = 0; frame < 32 && context.Rip; ++frame) {
    PrintFrame(frame == 0 ? "at" : "from", context.Rip);
    DWORD64 imageBase = 0;
    RUNTIME_FUNCTION* function = RtlLookupFunctionEntry(context.Rip, &imageBase, nullptr);
    if (!function) {  // a leaf function: the return address is on top of the stack
      context.Rip = *reinterpret_cast<DWORD64*>(context.Rsp);
      context.Rsp += 8;
      continue;
    }
    void* handlerData = nullptr;
    DWORD64 establisher = 0;
    RtlVirtualUnwind(UNW_FLAG_NHANDLER, imageBase, context.Rip, function, &context, &handlerData, &establisher,
                     nullptr);
  }
#else
  PrintFrame("at", at.Eip);
#endif
}

LONG WINAPI ReportCrash(EXCEPTION_POINTERS* exception) {
  static std::atomic<bool> reported{false};
  if (!reported.exchange(true)) {
    std::fflush(stdout);
    std::fprintf(stderr, "crash: exception %08lX in test case \"%s\"\n",
                 static_cast<unsigned long>(exception->ExceptionRecord->ExceptionCode), g_testCase);
    if (exception->ContextRecord) PrintStack(*exception->ContextRecord);
    std::fflush(stderr);
  }
  TerminateProcess(GetCurrentProcess(), 3);
  return EXCEPTION_EXECUTE_HANDLER;
}

}  // namespace

void ReportCrashesAndEnd() {
  SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOGPFAULTERRORBOX);
  SetUnhandledExceptionFilter(ReportCrash);
}

}  // namespace br::test
